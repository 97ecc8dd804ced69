// Framebuffers: what is drawn into instead of a window.
#pragma once

#include "oru/core/utility/integerrect.h"
#include "oru/oru_ogl/ogl/object.h"
#include "oru/oru_ogl/ogl/texture.h"

#include <cstddef>
#include <initializer_list>
#include <string>

namespace ORU::OGL {

class Buffer;
class MutablePixelView;
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
///
/// What clears, reads and copies takes a pointer to a framebuffer, null for the window's own, binds
/// it for itself and puts back what was bound. Rectangles begin at the lower left corner there, as
/// OpenGL counts rows from below.
class ORU_API Framebuffer : public Object {
public:
    /// Where an image is attached: colours at `Color(index)`.
    enum AttachmentPoint : unsigned int {
        ATTACHMENT_COLOR0 = 0,        ///< GL_COLOR_ATTACHMENT0
        ATTACHMENT_DEPTH = 0x100,     ///< GL_DEPTH_ATTACHMENT
        ATTACHMENT_STENCIL,           ///< GL_STENCIL_ATTACHMENT
        ATTACHMENT_DEPTH_AND_STENCIL, ///< both, for one image that holds both
        ATTACHMENT_NONE               ///< in lists of draw buffers: what is written is dropped
    };

    /// The attachment point of a colour index.
    static constexpr AttachmentPoint Color(unsigned int index) {
        // One beyond all colours stays one, and is refused as such where it is used.
        return static_cast<AttachmentPoint>(index < ATTACHMENT_DEPTH ? index
                                                                     : ATTACHMENT_DEPTH - 1);
    }

    /// What `Blit` copies; several are joined by `|`.
    enum Contents : unsigned int {
        CONTENTS_COLOR = 1,  ///< GL_COLOR_BUFFER_BIT: the read buffer to all draw buffers
        CONTENTS_DEPTH = 2,  ///< GL_DEPTH_BUFFER_BIT
        CONTENTS_STENCIL = 4 ///< GL_STENCIL_BUFFER_BIT
    };

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
    /// to both. Of the later formats (GL_DEPTH24_STENCIL8, GL_DEPTH_COMPONENT32F and the like) all
    /// count as colours here: see `attachRenderbuffer`.
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

    /// @name Attach and detach at any point
    /// A texture may be bound meanwhile; drawing from the level that is drawn into is what has no
    /// defined result.
    /// @throws InternalException when the framebuffer is not bound, for a colour index that is too
    ///         large, and for ATTACHMENT_NONE
    /// @{

    /// Attaches a level of a texture, with all its layers or faces where it has such: a geometry
    /// shader says by `gl_Layer` where it draws.
    /// @throws InternalException also for such a texture before OpenGL 3.2
    /// @note glFramebufferTexture1DEXT, glFramebufferTexture2DEXT, glFramebufferTexture
    void attachTexture(Texture const &texture, unsigned int level, AttachmentPoint point);

    /// Attaches one image of a level: a layer of an array, a slice of a 3-D texture, a
    /// TextureCube::Face.
    /// @param layer index of the image, which must exist
    /// @throws InternalException also for a texture without layers, and without
    ///         GL_ARB_framebuffer_object
    /// @note glFramebufferTextureLayer, glFramebufferTexture2DEXT
    void attachLayer(Texture const &texture, unsigned int level, unsigned int layer,
                     AttachmentPoint point);

    /// Attaches a renderbuffer where you say, whatever its format asks for.
    /// @note glFramebufferRenderbufferEXT
    void attachRenderbuffer(Renderbuffer const &renderbuffer, AttachmentPoint point);

    /// Detaches whatever is there.
    /// @note glFramebufferRenderbufferEXT
    void detachFrom(AttachmentPoint point);
    /// @}

    /// Where each of a fragment shader's outputs goes, by its number: colours, or ATTACHMENT_NONE.
    /// It belongs to the framebuffer; a new one has colour 0 only.
    /// @throws InternalException when the framebuffer is not bound, before OpenGL 2.0, and for
    ///         depth or stencil in the list; ExceptionOGL for more than OpenGL has, or for a point
    ///         that is there twice
    /// @note glDrawBuffers
    void setDrawBuffers(std::initializer_list<AttachmentPoint> points);

    /// The colour that is read and copied from, or ATTACHMENT_NONE.
    /// @throws InternalException when the framebuffer is not bound, and for depth or stencil
    /// @note glReadBuffer
    void setReadBuffer(AttachmentPoint point);

    /// Why the framebuffer is incomplete, in words, with what is attached where; empty when it is
    /// complete.
    /// @throws InternalException when the framebuffer is not bound
    /// @note glCheckFramebufferStatusEXT, glGetFramebufferAttachmentParameterivEXT
    std::string incompleteness() const;

    /// What a GL framebuffer status means, in words; empty for GL_FRAMEBUFFER_COMPLETE.
    static char const *StatusText(unsigned int status);

    /// Binds the window's own framebuffer, whatever is bound.
    /// @note glBindFramebufferEXT
    static void BindDefault();

    /// Copies a rectangle of a framebuffer into a rectangle of another, scaled to its size. Copying
    /// from several samples to one averages them; the rectangles must be of the same size then.
    /// Outside the scissor rectangle nothing changes while the scissor test is on.
    /// @param source, destination null for the window's own
    /// @param contents Contents, joined by `|`
    /// @param filter FILTER_NEAREST, or FILTER_LINEAR for colours alone
    /// @throws InternalException without OpenGL 3.0 or GL_ARB_framebuffer_object, for an empty
    ///         rectangle or no contents, and for another filter; ExceptionOGL when OpenGL refuses
    /// @note glGetIntegerv, glBindFramebuffer, glBlitFramebuffer
    static void Blit(Framebuffer const *source, IntegerRect const &from,
                     Framebuffer const *destination, IntegerRect const &to, unsigned int contents,
                     Texture::Filter filter);

    /// Makes the samples of a framebuffer one colour for each pixel of another.
    /// @param size pixels, from the lower left corner on
    /// @throws as Blit
    /// @note glGetIntegerv, glBindFramebuffer, glBlitFramebuffer
    static void Resolve(Framebuffer const *source, Framebuffer const *destination,
                        size2 const &size);

    /// @name Clear a rectangle
    /// Whether or not the scissor test is on; colour, depth and stencil masks count. Nothing is
    /// cleared while GL_RASTERIZER_DISCARD is on, or a ConditionalRenderScope drops it.
    /// @param framebuffer null for the window's own
    /// @param part what is cleared, or null for all; put back afterwards is the scissor rectangle
    /// @throws InternalException without OpenGL 3.0, or for an empty rectangle; ExceptionOGL when
    ///         OpenGL refuses
    /// @note glGetIntegerv, glBindFramebuffer, glEnable, glScissor (with GL_ARB_viewport_array
    ///       glEnablei and glScissorIndexed, as the first viewport's is what counts),
    ///       glClearBufferfv, glClearBufferiv, glClearBufferuiv, glClearBufferfi
    /// @{

    /// @param drawBuffer index in the list of draw buffers
    /// @param rgba four components
    static void ClearColor(Framebuffer const *framebuffer, unsigned int drawBuffer,
                           float const *rgba, IntegerRect const *part);
    /// The same where the colours are signed integers.
    static void ClearColor(Framebuffer const *framebuffer, unsigned int drawBuffer, int const *rgba,
                           IntegerRect const *part);
    /// The same where the colours are unsigned integers.
    static void ClearColor(Framebuffer const *framebuffer, unsigned int drawBuffer,
                           unsigned int const *rgba, IntegerRect const *part);
    /// @param depth from 0 to 1
    static void ClearDepth(Framebuffer const *framebuffer, float depth, IntegerRect const *part);
    /// @param stencil a value of the stencil buffer
    static void ClearStencil(Framebuffer const *framebuffer, int stencil, IntegerRect const *part);
    /// @param depth, stencil as above
    static void ClearDepthAndStencil(Framebuffer const *framebuffer, float depth, int stencil,
                                     IntegerRect const *part);
    /// @}

    /// Reads a rectangle of the read buffer, of depth or of stencil, from the lowest row up.
    /// @param framebuffer null for the window's own; it must be complete, and of one sample
    /// @param format, type of the pixels at `dst`, which holds all of them
    /// @param alignment bytes that rows are aligned to: 1, 2, 4 or 8
    /// @throws InternalException without OpenGL 3.0 or GL_ARB_framebuffer_object, for an empty
    ///         rectangle and for other alignments; ExceptionOGL when OpenGL refuses
    /// @note glGetIntegerv, glBindFramebuffer, glPixelStorei, glReadPixels
    static void Read(Framebuffer const *framebuffer, IntegerRect const &part,
                     Texture::Format format, Texture::Type type, void *dst, unsigned int alignment);

    /// Reads into a buffer, which becomes a pixel pack buffer. What was bound as such is bound
    /// again at the end.
    /// @param offset bytes from the buffer's beginning
    /// @throws InternalException also for a mapped buffer
    static void Read(Framebuffer const *framebuffer, IntegerRect const &part,
                     Texture::Format format, Texture::Type type, Buffer *buffer, std::size_t offset,
                     unsigned int alignment);

    /// Reads the rectangle that begins at (x, y) and has the pixels' sides, into memory that is
    /// long enough for it. Pixel storage is as it was afterwards, also after a failure.
    /// @throws InternalException also for pixels of three sides
    static void Read(Framebuffer const *framebuffer, int x, int y, MutablePixelView const &pixels);

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
    void attachImage(AttachmentPoint point, unsigned int image, unsigned int name,
                     unsigned int level);
    static unsigned int AttachmentFor(Renderbuffer const &renderbuffer, unsigned int colorIndex);
};

} // namespace ORU::OGL
