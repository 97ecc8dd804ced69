// A context for drawing into OpenGL objects only.
#pragma once

#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ogl/ogl/context.h"

namespace ORU::OGL {

class InternalWindow;

/// A rendering context on a hidden window. Draw into framebuffers with textures or renderbuffers;
/// the window's own buffers are not meant to be read. The thread that made it destroys it.
class ORU_API ContextOffscreen : public Context {
public:
    /// A context on a display device, in a share group of its own.
    /// @throws LogicalException when the context cannot be made
    explicit ContextOffscreen(DisplayDeviceKey const &key = Context::PrimaryDisplayDevice());

    /// A context on the same device as another, sharing its objects.
    /// @throws InternalException for null, LogicalException when the context cannot be made
    explicit ContextOffscreen(Context const *share);

    /// Deletes the rendering context and the window.
    ~ContextOffscreen() override;

private:
    void create(Context const *share);

    ScopedPtr<InternalWindow> window_;
};

} // namespace ORU::OGL
