// A hidden window that lends its device context to contexts that draw into no window.
#include "oru/oru_ogl/internalwindow.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/platformgl.h"

#include <boost/format.hpp>

#include <new>

namespace ORU::OGL {

namespace {

constexpr DWORD kStyle = WS_OVERLAPPEDWINDOW;
constexpr DWORD kExtendedStyle = WS_EX_APPWINDOW | WS_EX_WINDOWEDGE;

} // namespace

InternalWindow::InternalWindow(short x, short y) : window_(nullptr) {
    std::string const name = className();

    WNDCLASSEXA windowClass = {};
    windowClass.cbSize = sizeof windowClass;
    windowClass.style = CS_CLASSDC;
    windowClass.lpfnWndProc = ::DefWindowProcW;
    windowClass.hInstance = ::GetModuleHandleW(nullptr);
    windowClass.hCursor = ::LoadCursorW(nullptr, reinterpret_cast<LPCWSTR>(IDC_ARROW));
    windowClass.lpszClassName = name.c_str();
    if (!::RegisterClassExA(&windowClass))
        ORU_THROW_INTERNAL("Unable to register window class");

    RECT frame = {0, 0, 8, 8};
    ::AdjustWindowRectEx(&frame, kStyle, FALSE, kExtendedStyle);
    window_ = ::CreateWindowExA(kExtendedStyle, name.c_str(), nullptr,
                                kStyle | WS_CLIPSIBLINGS | WS_CLIPCHILDREN, x, y,
                                frame.right - frame.left, frame.bottom - frame.top, nullptr,
                                nullptr, windowClass.hInstance, nullptr);
    if (!window_) {
        ::UnregisterClassA(name.c_str(), windowClass.hInstance);
        ORU_THROW_INTERNAL("Unable to create window");
    }
}

InternalWindow::InternalWindow(ambra::lumo::TVec2<int> const &origin)
    : InternalWindow(static_cast<short>(origin.x), static_cast<short>(origin.y)) {}

InternalWindow::~InternalWindow() {
    DropExceptions([this] { destroy(); });
}

void InternalWindow::destroy() {
    ULONG_PTR const windowClass = ::GetClassLongPtrA(window_, GCW_ATOM);
    HDC const dc = ::GetDC(window_);
    ORU_ASSERT_TEXT("hDC != 0", dc);
    if (!::ReleaseDC(window_, dc))
        ORU_THROW_INTERNAL("Unable to release the device context");
    ::DestroyWindow(window_);
    // Without the memory for a name the class goes by its number: if it stayed, the next window at
    // this address could not be made.
    std::string name;
    char const *key = reinterpret_cast<char const *>(windowClass);
    try {
        name = className();
        key = name.c_str();
    } catch (std::bad_alloc const &) {
    }
    if (!::UnregisterClassA(key, ::GetModuleHandleW(nullptr)))
        ORU_THROW_INTERNAL("Unable to unregister window class");
}

/// Unique among the live windows, as it carries the object's own address.
std::string InternalWindow::className() const {
    return (boost::format("OpenGL%p") % static_cast<void const *>(this)).str();
}

} // namespace ORU::OGL
