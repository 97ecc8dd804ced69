/* Sleeps for ever without a window, so that Wine's services stay up between programs: a program
   then starts in a tenth of a second instead of three. */
#include <windows.h>

int WINAPI wWinMain(HINSTANCE instance, HINSTANCE previous, wchar_t *line, int show) {
    (void)instance, (void)previous, (void)line, (void)show;
    Sleep(INFINITE);
    return 0;
}
