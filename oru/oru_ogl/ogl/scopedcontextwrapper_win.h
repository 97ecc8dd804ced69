// Remembering the current context for a scope, and releasing it.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/core/utility/windowsforward.h"

namespace ORU::OGL {

/// Makes the context and device context that it found current again at its end, on the same thread.
/// While both are still current then, it makes no WGL call.
class ORU_API ScopedContextWrapper {
public:
    /// Remembers what is current.
    /// @param restore kept for the host; the destructor restores in any case
    explicit ScopedContextWrapper(bool restore = true);

    /// A failure to restore is dropped.
    virtual ~ScopedContextWrapper();

    ScopedContextWrapper(ScopedContextWrapper const &) = delete;
    ScopedContextWrapper &operator=(ScopedContextWrapper const &) = delete;

private:
    HDC deviceContext_;
    HGLRC renderContext_;
    [[maybe_unused]] bool restore_; ///< read by nobody; has its place in the binary interface
};

/// Makes no context current on the calling thread.
ORU_API void ReleaseOGLContext();

} // namespace ORU::OGL
