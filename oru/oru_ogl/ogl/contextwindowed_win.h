// A context that draws into a window of the host.
#pragma once

#include "oru/oru_ogl/ogl/context.h"

namespace ORU::OGL {

/// A rendering context on a host's window, which it neither owns nor touches otherwise.
///
/// It takes a device context of the window and, leaving the window alone from then on, never gives
/// it back. Give the window's class the style CS_OWNDC: its device contexts are then all the same,
/// while without it each rendering context made on the window costs one more.
///
/// ```cpp
/// ContextWindowed context(window, BufferFormat::FORMAT_RGBA8, Context::BUFFERING_DOUBLE,
///                         Context::MULTISAMPLING_NONE, nullptr);
/// context.makeCurrent();
/// ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
/// context.swapBuffers();
/// ```
class ORU_API ContextWindowed : public Context {
public:
    /// Makes a context on the display device that shows the window. A window takes one pixel format
    /// in its life, so later contexts on it need the same format.
    /// @param window the window, which must outlive the context
    /// @param share context to share objects with, or null for a share group of its own
    /// @throws InternalException when the window's display cannot be determined, LogicalException
    ///         when the pixel format or the context cannot be had
    ContextWindowed(HWND window, BufferFormat const &format, Buffering buffering,
                    Multisampling multisampling, Context const *share);

    /// Deletes the rendering context.
    ~ContextWindowed() override;

    HWND hWnd() const { return window_; } ///< The host's window.

    /// Makes swapBuffers of the current context wait for the vertical retrace, or not.
    /// @throws InternalException without WGL_EXT_swap_control
    /// @note wglSwapIntervalEXT
    void enableSyncToVerticalRetrace(bool enable);

private:
    HWND window_;
};

} // namespace ORU::OGL
