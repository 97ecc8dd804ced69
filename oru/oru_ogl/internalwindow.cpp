// A hidden window that lends its device context to contexts that draw into no window.
#include "oru/oru_ogl/internalwindow.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/platformgl.h"

#include <cstdint>
#include <cstdio>

namespace ORU::OGL {

namespace {

constexpr DWORD kStyle = WS_OVERLAPPEDWINDOW;
constexpr DWORD kExtendedStyle = WS_EX_APPWINDOW | WS_EX_WINDOWEDGE;

} // namespace

InternalWindow::InternalWindow(short x, short y) : window_(nullptr) {
    ClassName const name = className();

    WNDCLASSEXA windowClass = {};
    windowClass.cbSize = sizeof windowClass;
    windowClass.style = CS_CLASSDC;
    windowClass.lpfnWndProc = ::DefWindowProcW;
    windowClass.hInstance = ::GetModuleHandleW(nullptr);
    windowClass.hCursor = ::LoadCursorW(nullptr, reinterpret_cast<LPCWSTR>(IDC_ARROW));
    windowClass.lpszClassName = name.data();
    if (!::RegisterClassExA(&windowClass))
        ORU_THROW_INTERNAL("Unable to register window class");

    RECT frame = {0, 0, 8, 8};
    ::AdjustWindowRectEx(&frame, kStyle, FALSE, kExtendedStyle);
    window_ = ::CreateWindowExA(kExtendedStyle, name.data(), nullptr,
                                kStyle | WS_CLIPSIBLINGS | WS_CLIPCHILDREN, x, y,
                                frame.right - frame.left, frame.bottom - frame.top, nullptr,
                                nullptr, windowClass.hInstance, nullptr);
    if (!window_) {
        ::UnregisterClassA(name.data(), windowClass.hInstance);
        ORU_THROW_INTERNAL("Unable to create window");
    }
}

InternalWindow::InternalWindow(ambra::lumo::TVec2<int> const &origin)
    : InternalWindow(static_cast<short>(origin.x), static_cast<short>(origin.y)) {}

InternalWindow::~InternalWindow() {
    DropExceptions([this] { destroy(); });
}

void InternalWindow::destroy() {
    HDC const dc = ::GetDC(window_);
    ORU_ASSERT_TEXT("hDC != 0", dc);
    if (!::ReleaseDC(window_, dc))
        ORU_THROW_INTERNAL("Unable to release the device context");
    ::DestroyWindow(window_);
    if (!::UnregisterClassA(className().data(), ::GetModuleHandleW(nullptr)))
        ORU_THROW_INTERNAL("Unable to unregister window class");
}

/// Unique among the live windows, as it carries the object's own address. What Boost.Format makes
/// of "OpenGL%p", without the streams of it: they drop the address when memory is short, and a
/// class of another name would stay registered.
InternalWindow::ClassName InternalWindow::className() const {
    ClassName name;
    std::snprintf(name.data(), name.size(), "OpenGL0x%llx",
                  static_cast<unsigned long long>(reinterpret_cast<std::uintptr_t>(this)));
    return name;
}

} // namespace ORU::OGL
