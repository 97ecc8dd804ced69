// The short-lived context on which a pixel format is searched while no context is current.
#pragma once

#include "oru/core/utility/scopedptr.h"
#include "oru/core/utility/windowsforward.h"
#include "oru/oru_ogl/internalwindow.h"

namespace ORU::OGL::internal {

/// Owns a hidden window and a rendering context on it; both may be absent.
class TemporaryContext {
public:
    TemporaryContext() = default;
    ~TemporaryContext();

    TemporaryContext(TemporaryContext const &) = delete;
    TemporaryContext &operator=(TemporaryContext const &) = delete;

    /// Makes the window. @return its device context
    HDC makeWindow();

    /// Takes over a rendering context on the window and makes it current.
    void adopt(HGLRC context);

    /// Makes no context current and destroys what there is.
    /// @return false when the system refused to delete the rendering context
    bool release();

    /// The same where no context is current already.
    bool destroy();

private:
    ScopedPtr<InternalWindow> window_;
    HDC deviceContext_ = nullptr;
    HGLRC renderContext_ = nullptr;
};

} // namespace ORU::OGL::internal
