// A context that somebody else made, adopted.
#pragma once

#include "oru/oru_ogl/ogl/context.h"

namespace ORU::OGL {

/// Adopts a rendering context so that contexts of the library can share with it. Its owner keeps
/// it, and should destroy this object first.
///
/// ```cpp
/// ContextWrapped const adopted; // the toolkit's context, which is current
/// ContextOffscreen worker(&adopted);
/// ```
///
/// Finding the share group makes contexts of the library current for a moment, so they must not be
/// current on other threads then.
class ORU_API ContextWrapped : public Context {
public:
    /// Adopts a context by its handles.
    /// @param window the window the context draws to, which tells its display device; null to take
    ///        the device of the calling thread's current context
    /// @throws InternalException for a null handle, or when the device cannot be determined
    ContextWrapped(HDC deviceContext, HGLRC renderContext, HWND window);

    /// Adopts the calling thread's current context.
    /// @throws InternalException when there is none
    ContextWrapped();

    /// Leaves the adopted context as it is.
    ~ContextWrapped() override;

    /// Makes the adopted context current on the calling thread.
    /// @throws InternalException "ContextWrapped Object leaked" when the system refuses, as it does
    ///         when the adopted context was destroyed by its owner
    void makeCurrent() const override;

private:
    static DisplayDeviceKey DeviceOfCurrentContext();
    void adopt(HDC deviceContext, HWND window);
};

} // namespace ORU::OGL
