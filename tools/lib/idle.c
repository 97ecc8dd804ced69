/* Brings the desktop up, whose process Wine starts for the first program that needs it, and then
   sleeps for ever, so that Wine's services stay up between programs: a program then starts in a
   tenth of a second instead of three. With an argument it does not sleep: when it ends, everything
   is up. */
#include <windows.h>

int WINAPI wWinMain(HINSTANCE instance, HINSTANCE previous, wchar_t *line, int show) {
    (void)instance, (void)previous, (void)show;
    GetDesktopWindow();
    if (!line[0])
        Sleep(INFINITE);
    return 0;
}
