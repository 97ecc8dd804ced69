// Framebuffers: what is drawn into instead of a window.
#pragma once

#include "oru/oru_ogl/ogl/object.h"

namespace ORU::OGL {

class Renderbuffer;
class Texture2;
class Texture2DArray;

/// One framebuffer object of GL_EXT_framebuffer_object, and what is attached to it.
///
/// ```cpp
/// Framebuffer framebuffer;
/// framebuffer.bind();
/// framebuffer.attach(&texture, 0, 0);
/// if (framebuffer.statusOkay(nullptr))
///     … draw …
/// framebuffer.unbind();
/// ```
///
/// Bind the framebuffer before anything is attached, detached or asked, except by the overloads
/// that take bare GL values. It does not remember what is attached: keep the images alive.
class ORU_API Framebuffer : public Object {
public:
    /// Makes a framebuffer without images and does not bind it.
    /// @throws InternalException without the extension
    /// @note glGenFramebuffersEXT
    Framebuffer();

    /// A framebuffer that was made elsewhere. After a failure the name is the caller's as before.
    /// @throws InternalException without the extension, and for a name that is no framebuffer
    /// @note glIsFramebufferEXT
    Framebuffer(unsigned int name, ownership_tag ownership);

    Framebuffer(Framebuffer &&other) noexcept = default;
    Framebuffer &operator=(Framebuffer &&other) noexcept;

    /// Deletes the framebuffer that the object owns. @note glDeleteFramebuffersEXT
    ~Framebuffer() override;

    /// Makes this what is drawn into and read from.
    /// @note glBindFramebufferEXT
    void bind();

    /// Binds the context's own framebuffer, the window.
    /// @throws InternalException when this framebuffer is not bound
    /// @note glBindFramebufferEXT
    void unbind();

    /// @name Attach an image
    /// @param level mipmap level
    /// @param colorIndex index of the colour attachment, below `MaxColorAttachments()`
    /// @throws InternalException for null, for a texture that is bound to its target, when the
    ///         framebuffer is not bound, or for an index that is too large
    /// @{

    /// @param layer index of the texture's layer, which must exist
    /// @throws InternalException also without GL_ARB_framebuffer_object
    /// @note glFramebufferTextureLayer
    void attach(Texture2DArray *texture, unsigned int layer, unsigned int level,
                unsigned int colorIndex);

    /// @note glFramebufferTexture2DEXT
    void attach(Texture2 *texture, unsigned int level, unsigned int colorIndex);

    /// Attaches to the point that the renderbuffer's format asks for; one with depth and stencil
    /// to both.
    /// @param colorIndex 0 for a renderbuffer that holds no colours
    /// @note glFramebufferRenderbufferEXT
    void attach(Renderbuffer *renderbuffer, unsigned int colorIndex);

    /// Attaches to the bound framebuffer, whichever that is; checks the index only.
    /// @note glFramebufferTexture2DEXT
    void attach(unsigned int textureID, unsigned int textureTarget, unsigned int level,
                unsigned int colorIndex);
    /// @}

    /// @name Detach what is attached
    /// @throws InternalException for null, when the framebuffer is not bound, or for an index that
    ///         is too large
    /// @{

    /// @note glFramebufferTexture2DEXT
    void detach(Texture2 *texture, unsigned int colorIndex);

    /// The stencil attachment of a renderbuffer with depth and stencil stays.
    /// @note glFramebufferRenderbufferEXT
    void detach(Renderbuffer *renderbuffer, unsigned int colorIndex);

    /// Detaches from the bound framebuffer, whichever that is; checks nothing.
    /// @note glFramebufferTexture2DEXT
    void detach(unsigned int textureTarget, unsigned int framebufferTarget,
                unsigned int colorIndex);
    /// @}

    /// Whether the framebuffer is complete, so that it can be drawn into.
    /// @param status receives the GL status, unless null
    /// @throws InternalException when the framebuffer is not bound
    /// @note glCheckFramebufferStatusEXT
    bool statusOkay(unsigned int *status) const;

    /// How many colour attachments a framebuffer can have.
    /// @note glGetIntegerv
    static unsigned int MaxColorAttachments();

    /// Whether the current context has GL_EXT_framebuffer_object; false without a context.
    static bool IsSupported();

private:
    void deleteObject() noexcept;
    void requireBound(char const *failure) const;
    static unsigned int AttachmentFor(Renderbuffer const &renderbuffer, unsigned int colorIndex);
};

} // namespace ORU::OGL
