// What the context tests share: a plain window, counting of leftovers.
#pragma once

#include "tests/support/failure.h"

#include "oru/oru_ogl/extensionator/wgl/wglforwarder.h"
#include "oru/oru_ogl/platformgl.h"

#include <atomic>
#include <string>
#include <vector>

namespace oru_test {

/// A window of the host.
class TestWindow {
public:
    TestWindow(int x = 20, int y = 20, int width = 64, int height = 48)
        : hwnd_(::CreateWindowA("STATIC", "", WS_POPUP | WS_VISIBLE, x, y, width, height, nullptr,
                                nullptr, ::GetModuleHandleW(nullptr), nullptr)) {}
    ~TestWindow() { ::DestroyWindow(hwnd_); }
    TestWindow(TestWindow const &) = delete;
    TestWindow &operator=(TestWindow const &) = delete;

    HWND hwnd() const { return hwnd_; }

private:
    HWND hwnd_;
};

/// The class names of this thread's hidden windows of the library.
inline std::vector<std::string> InternalWindowClasses() {
    std::vector<std::string> names;
    auto const visit = [](HWND window, LPARAM list) -> BOOL {
        char name[64] = "";
        ::GetClassNameA(window, name, sizeof name);
        if (std::string(name).compare(0, 6, "OpenGL") == 0)
            reinterpret_cast<std::vector<std::string> *>(list)->push_back(name);
        return TRUE;
    };
    ::EnumThreadWindows(::GetCurrentThreadId(), visit, reinterpret_cast<LPARAM>(&names));
    return names;
}

/// Counts the rendering contexts that the library makes, by either function, and deletes.
class ContextCounter : public ORU::OGL::WGLForwarder {
public:
    ContextCounter() { ORU::OGL::WGLInterceptor::Instance()->addInterceptor(this); }
    ~ContextCounter() override { ORU::OGL::WGLInterceptor::Instance()->popInterceptor(); }

    HGLRC wcgmCreateContext(char const *file, unsigned int line, HDC dc) override {
        return Counted(WGLForwarder::wcgmCreateContext(file, line, dc));
    }
    BOOL wcgmDeleteContext(char const *file, unsigned int line, HGLRC rc) override {
        BOOL const deleted = WGLForwarder::wcgmDeleteContext(file, line, rc);
        sAlive -= deleted ? 1 : 0;
        return deleted;
    }
    PROC wcgmGetProcAddress(char const *file, unsigned int line, char const *name) override {
        PROC const real = WGLForwarder::wcgmGetProcAddress(file, line, name);
        if (!real || std::string(name) != "wglCreateContextAttribsARB")
            return real;
        sCreate =
            reinterpret_cast<PFNWGLCREATECONTEXTATTRIBSARBPROC>(reinterpret_cast<void *>(real));
        return reinterpret_cast<PROC>(reinterpret_cast<void *>(&CreateContextAttribs));
    }

    static int Alive() { return sAlive; }
    static int Made() { return sMade; }

private:
    static HGLRC Counted(HGLRC made) {
        sAlive += made ? 1 : 0;
        ++sMade;
        return made;
    }
    static HGLRC WINAPI CreateContextAttribs(HDC dc, HGLRC share, int const *attributes) {
        return Counted(sCreate(dc, share, attributes));
    }

    static inline std::atomic<int> sAlive{0};
    static inline std::atomic<int> sMade{0};
    static inline PFNWGLCREATECONTEXTATTRIBSARBPROC sCreate = nullptr;
};

} // namespace oru_test
