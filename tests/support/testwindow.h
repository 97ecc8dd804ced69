// A plain window of the host, and the hidden ones of the library.
#pragma once

#include "oru/oru_ogl/platformgl.h"

#include <string>

namespace oru_test {

class TestWindow {
public:
    /// @param style WS_VISIBLE to be shown, for which the system waits a second or two
    explicit TestWindow(DWORD style = WS_VISIBLE)
        : hwnd_(::CreateWindowA("STATIC", "", WS_POPUP | style, 20, 20, 64, 48, nullptr, nullptr,
                                ::GetModuleHandleW(nullptr), nullptr)) {}
    ~TestWindow() { ::DestroyWindow(hwnd_); }
    TestWindow(TestWindow const &) = delete;
    TestWindow &operator=(TestWindow const &) = delete;

    HWND hwnd() const { return hwnd_; }

private:
    HWND hwnd_;
};

/// How many hidden windows of the library this thread has.
inline int InternalWindows() {
    int count = 0;
    auto const visit = [](HWND window, LPARAM sum) -> BOOL {
        char name[64] = "";
        ::GetClassNameA(window, name, sizeof name);
        *reinterpret_cast<int *>(sum) += std::string(name).compare(0, 6, "OpenGL") == 0;
        return TRUE;
    };
    ::EnumThreadWindows(::GetCurrentThreadId(), visit, reinterpret_cast<LPARAM>(&count));
    return count;
}

} // namespace oru_test
