// The library's own, not for hosts: a hidden window that lends its device context to contexts that
// draw into no window.
#pragma once

#include "oru/core/math/tvec2.h"
#include "oru/core/utility/windowsforward.h"

#include <array>

namespace ORU::OGL {

/// An 8 by 8 window of its own class, never shown. Windows demands that the thread that made it
/// destroys it.
class InternalWindow {
public:
    /// @param x, y desktop position, which decides on which display the window lies
    /// @throws InternalException when the class or the window cannot be made
    InternalWindow(short x, short y);

    /// At a display's origin, whose low 16 bits count.
    explicit InternalWindow(ambra::lumo::TVec2<int> const &origin);

    /// Destroys the window and its class; a failure is dropped.
    ~InternalWindow();

    InternalWindow(InternalWindow const &) = delete;
    InternalWindow &operator=(InternalWindow const &) = delete;

    HWND hWnd() const { return window_; }

private:
    using ClassName = std::array<char, 32>;

    ClassName className() const;
    void destroy();

    HWND window_;
};

} // namespace ORU::OGL
