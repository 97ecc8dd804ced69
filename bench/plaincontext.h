// A context without the library, to compare with.
#pragma once

#include "oru/oru_ogl/platformgl.h"

namespace oru_bench {

/// A context as a host makes it by hand: a hidden window, a pixel format, every entry point looked
/// up.
class PlainContext {
public:
    PlainContext() {
        WNDCLASSW windowClass = {};
        windowClass.style = CS_OWNDC;
        windowClass.lpfnWndProc = ::DefWindowProcW;
        windowClass.hInstance = ::GetModuleHandleW(nullptr);
        windowClass.lpszClassName = L"plain context";
        ::RegisterClassW(&windowClass);
        window_ = ::CreateWindowW(L"plain context", nullptr, WS_OVERLAPPEDWINDOW, 0, 0, 8, 8,
                                  nullptr, nullptr, windowClass.hInstance, nullptr);
        dc_ = ::GetDC(window_);
        PIXELFORMATDESCRIPTOR format = {};
        format.nSize = sizeof format;
        format.nVersion = 1;
        format.dwFlags = PFD_DRAW_TO_WINDOW | PFD_SUPPORT_OPENGL;
        format.iPixelType = PFD_TYPE_RGBA;
        format.cColorBits = 24;
        ::SetPixelFormat(dc_, ::ChoosePixelFormat(dc_, &format), &format);
        context_ = ::wglCreateContext(dc_);
    }

    ~PlainContext() {
        ::wglMakeCurrent(nullptr, nullptr);
        ::wglDeleteContext(context_);
        ::ReleaseDC(window_, dc_);
        ::DestroyWindow(window_);
    }

    PlainContext(PlainContext const &) = delete;
    PlainContext &operator=(PlainContext const &) = delete;

    void makeCurrent() { ::wglMakeCurrent(dc_, context_); }

    /// The look-up that a function loader does.
    static int loadAll() {
        int found = 0;
#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    found += ::wglGetProcAddress("gl" #Name) ? 1 : 0;
#include "oru/oru_ogl/extensionator/gloperations.inc"
        return found;
    }

private:
    HWND window_;
    HDC dc_;
    HGLRC context_;
};

} // namespace oru_bench
