// Prints each argument in UTF-8 on a line of its own and whether it names an existing file.
#include <windows.h>

#include <cstdio>
#include <string>

int wmain(int count, wchar_t **arguments) {
    for (int i = 1; i < count; ++i) {
        char text[1024];
        WideCharToMultiByte(CP_UTF8, 0, arguments[i], -1, text, sizeof text, nullptr, nullptr);
        bool const exists = GetFileAttributesW(arguments[i]) != INVALID_FILE_ATTRIBUTES;
        std::printf("%s|%s\n", text, exists ? "file" : "-");
    }
    return 0;
}
