// Renderbuffers: storage to render into that no shader reads.
#pragma once

#include "oru/oru_ogl/ogl/object.h"

namespace ORU::OGL {

/// One renderbuffer of GL_EXT_framebuffer_object; attach it to a Framebuffer.
class ORU_API Renderbuffer : public Object {
public:
    /// Makes a renderbuffer and its storage. The bound renderbuffer stays bound.
    /// @param format GL internal format, which also says what the buffer is attached as: the depth
    ///        formats as depth, the stencil index formats as stencil, GL_DEPTH_STENCIL_EXT as both,
    ///        any other as a colour
    /// @param width, height pixels, at most `MaxSize()`
    /// @throws InternalException without the extension or for a size that is too large,
    ///         ExceptionOGL for what OpenGL itself refuses
    /// @note glGenRenderbuffersEXT, glRenderbufferStorageEXT
    Renderbuffer(unsigned int format, int width, int height);

    /// Makes a renderbuffer with several samples a pixel, for `Framebuffer::Resolve`.
    /// @param samples of a pixel, at most `MaxSamples()`; OpenGL may take more
    /// @throws InternalException also without OpenGL 3.0 or GL_ARB_framebuffer_object
    /// @note glGenRenderbuffersEXT, glRenderbufferStorageMultisample
    Renderbuffer(unsigned int format, int width, int height, int samples);

    /// A renderbuffer that was made elsewhere; size and format are what OpenGL tells. After a
    /// failure the name is the caller's as before.
    /// @throws InternalException without the extension, and for a name that is no renderbuffer
    /// @note glIsRenderbufferEXT, glBindRenderbufferEXT, glGetRenderbufferParameterivEXT
    Renderbuffer(unsigned int name, ownership_tag ownership);

    Renderbuffer(Renderbuffer &&other) noexcept = default;
    Renderbuffer &operator=(Renderbuffer &&other) noexcept;

    /// Deletes the renderbuffer that the object owns. @note glDeleteRenderbuffersEXT
    ~Renderbuffer() override;

    /// The GL internal format.
    unsigned int format() const {
        requireObject();
        return format_;
    }
    /// Pixels in a row.
    int width() const {
        requireObject();
        return width_;
    }
    /// Rows.
    int height() const {
        requireObject();
        return height_;
    }

    /// Makes this the bound renderbuffer.
    /// @note glBindRenderbufferEXT
    void bind();

    /// Binds no renderbuffer.
    /// @throws InternalException when this one is not bound
    /// @note glBindRenderbufferEXT
    void unbind();

    /// The largest width and height in pixels. @note glGetIntegerv
    static int MaxSize();

    /// The most samples of a pixel.
    /// @throws ExceptionOGL where the context has no renderbuffers of several samples
    /// @note glGetIntegerv
    static int MaxSamples();

    /// Whether the current context has GL_EXT_framebuffer_object; false without a context.
    static bool IsSupported();

protected:
    friend class Framebuffer;

    /// The GL attachment point that the format asks for.
    unsigned int attachment() const {
        requireObject();
        return attachment_;
    }

private:
    void makeStorage(int samples);
    void deleteObject() noexcept;

    unsigned int format_;
    unsigned int attachment_;
    int width_;
    int height_;
};

} // namespace ORU::OGL
