// Framebuffers: what is drawn into instead of a window.
#include "oru/oru_ogl/ogl/framebuffer.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <utility>
#include <vector>

namespace ORU::OGL {

namespace {

constexpr char kAttachUnbound[] = "Framebuffer Objects must be bound to attach objects";
constexpr char kDetachUnbound[] = "Framebuffer Object must be bound before detaching objects";

/// The attachment point of a colour index, which must exist.
GLenum ColorAttachment(unsigned int colorIndex) {
    unsigned int const maximum = Framebuffer::MaxColorAttachments();
    if (colorIndex >= maximum)
        ORU_THROW_INTERNAL("Invalid color buffer attachment only ", maximum,
                           " attachments supported with ", colorIndex, " requested");
    return GL_COLOR_ATTACHMENT0_EXT + colorIndex;
}

/// Calls `attach` with the GL points that a point stands for.
template<class Attach>
void ForEachPoint(Framebuffer::AttachmentPoint point, Attach attach) {
    if (point >= Framebuffer::ATTACHMENT_NONE)
        ORU_THROW_INTERNAL("Nothing can be attached at ATTACHMENT_NONE: name a colour, depth or "
                           "stencil");
    if (point < Framebuffer::ATTACHMENT_DEPTH)
        attach(ColorAttachment(point));
    if (point == Framebuffer::ATTACHMENT_DEPTH ||
        point == Framebuffer::ATTACHMENT_DEPTH_AND_STENCIL)
        attach(GL_DEPTH_ATTACHMENT_EXT);
    if (point == Framebuffer::ATTACHMENT_STENCIL ||
        point == Framebuffer::ATTACHMENT_DEPTH_AND_STENCIL)
        attach(GL_STENCIL_ATTACHMENT_EXT);
}

/// What draws into a point, or reads from it, as OpenGL takes it.
GLenum ColorBuffer(Framebuffer::AttachmentPoint point) {
    if (point == Framebuffer::ATTACHMENT_NONE)
        return GL_NONE;
    if (point >= Framebuffer::ATTACHMENT_DEPTH)
        ORU_THROW_INTERNAL("Depth and stencil are no draw or read buffers: name colours, or "
                           "ATTACHMENT_NONE");
    return ColorAttachment(point);
}

/// How many images a level of a texture has that can be attached one by one; 0 for just one.
std::uint64_t LayersOf(Texture const &texture, unsigned int level) {
    switch (texture.target()) {
    case GL_TEXTURE_1D_ARRAY:
        return texture.height(0);
    case GL_TEXTURE_3D:
        return std::max<std::uint64_t>(texture.depth(level), 1);
    case GL_TEXTURE_2D_ARRAY:
    case GL_TEXTURE_CUBE_MAP:
    case GL_TEXTURE_CUBE_MAP_ARRAY:
        return texture.depth(0);
    default:
        return 0;
    }
}

void RequireUnbound(Object const &texture) {
    // Drawing into a texture that is read at the same time has no defined result.
    if (texture.isBound())
        ORU_THROW_INTERNAL("Texture cannot be bound during attachment to framebuffer object");
}

} // namespace

Framebuffer::Framebuffer() : Object(GL_FRAMEBUFFER_EXT, GL_FRAMEBUFFER_BINDING_EXT) {
    ORU_ASSERT(IsSupported());
    try {
        ORU_GL(GenFramebuffersEXT, 1, &objectID_);
    } catch (...) {
        deleteObject(); // an error that was pending before ends the call when the name is made
        throw;
    }
    ORU_ASSERT(objectID_ != 0);
}

Framebuffer::Framebuffer(unsigned int name, ownership_tag ownership)
    : Object(GL_FRAMEBUFFER_EXT, GL_FRAMEBUFFER_BINDING_EXT, name, ownership) {
    ORU_ASSERT_SUPPORTED(GL_EXT_FRAMEBUFFER_OBJECT);
    internal::RequireName(ORU_GL(IsFramebufferEXT, name), name, "framebuffer");
}

Framebuffer &Framebuffer::operator=(Framebuffer &&other) noexcept {
    if (this != &other) {
        deleteObject();
        Object::operator=(std::move(other));
    }
    return *this;
}

Framebuffer::~Framebuffer() {
    deleteObject();
}

void Framebuffer::deleteObject() noexcept {
    if (ownsName())
        internal::Release([this] { ORU_GL(DeleteFramebuffersEXT, 1, &objectID_); });
}

void Framebuffer::bind() {
    ORU_GL(BindFramebufferEXT, target(), objectID_);
}

void Framebuffer::unbind() {
    requireBound("Framebuffer object must be bound before calling unbind()");
    ORU_GL(BindFramebufferEXT, target(), 0);
}

void Framebuffer::requireBound(char const *failure) const {
    if (!isBound())
        ORU_THROW_INTERNAL(failure);
}

void Framebuffer::attach(Texture2DArray *texture, unsigned int layer, unsigned int level,
                         unsigned int colorIndex) {
    ORU_ENFORCE_TEXT("poTex != NULL", texture);
    RequireUnbound(*texture);
    requireBound(kAttachUnbound);
    GLenum const attachment = ColorAttachment(colorIndex);
    if (layer >= texture->depth(0))
        ORU_THROW_INTERNAL("Array Index too large");
    ORU_ASSERT_SUPPORTED(GL_ARB_FRAMEBUFFER_OBJECT);
    ORU_GL(FramebufferTextureLayer, target(), attachment, texture->objectID(),
           static_cast<GLint>(level), static_cast<GLint>(layer));
}

void Framebuffer::attach(Texture2 *texture, unsigned int level, unsigned int colorIndex) {
    ORU_ENFORCE_TEXT("poTex != NULL", texture);
    RequireUnbound(*texture);
    requireBound(kAttachUnbound);
    GLenum const attachment = ColorAttachment(colorIndex);
    ORU_GL(FramebufferTexture2DEXT, target(), attachment, texture->target(), texture->objectID(),
           static_cast<GLint>(level));
}

void Framebuffer::attach(unsigned int textureID, unsigned int textureTarget, unsigned int level,
                         unsigned int colorIndex) {
    GLenum const attachment = ColorAttachment(colorIndex);
    ORU_GL(FramebufferTexture2DEXT, target(), attachment, textureTarget, textureID,
           static_cast<GLint>(level));
}

void Framebuffer::attach(Renderbuffer *renderbuffer, unsigned int colorIndex) {
    ORU_ENFORCE_TEXT("poBuffer != NULL", renderbuffer);
    requireBound(kAttachUnbound);
    GLenum const attachment = AttachmentFor(*renderbuffer, colorIndex);
    ORU_GL(FramebufferRenderbufferEXT, target(), attachment, GL_RENDERBUFFER_EXT,
           renderbuffer->objectID());
    if (renderbuffer->format() == GL_DEPTH_STENCIL_EXT)
        ORU_GL(FramebufferRenderbufferEXT, target(), GL_STENCIL_ATTACHMENT_EXT, GL_RENDERBUFFER_EXT,
               renderbuffer->objectID());
}

GLenum Framebuffer::AttachmentFor(Renderbuffer const &renderbuffer, unsigned int colorIndex) {
    ColorAttachment(colorIndex);
    GLenum const attachment = renderbuffer.attachment();
    if (attachment != GL_COLOR_ATTACHMENT0_EXT && colorIndex != 0)
        ORU_THROW_INTERNAL("Color buffer index is not supported with attachment:",
                           ORUOGLTokenName(attachment));
    return attachment + colorIndex;
}

void Framebuffer::attachImage(AttachmentPoint point, unsigned int image, unsigned int name,
                              unsigned int level) {
    ForEachPoint(point, [&](GLenum attachment) {
        auto const glLevel = static_cast<GLint>(level);
        if (image == GL_TEXTURE_1D)
            ORU_GL(FramebufferTexture1DEXT, target(), attachment, image, name, glLevel);
        else
            ORU_GL(FramebufferTexture2DEXT, target(), attachment, image, name, glLevel);
    });
}

void Framebuffer::attachTexture(Texture const &texture, unsigned int level, AttachmentPoint point) {
    unsigned int const name = texture.checkedID();
    requireBound(kAttachUnbound);
    if (LayersOf(texture, level) == 0)
        return attachImage(point, texture.target(), name, level);
    ORU_ASSERT_SUPPORTED(GL_VERSION_3_2);
    ForEachPoint(point, [&](GLenum attachment) {
        ORU_GL(FramebufferTexture, target(), attachment, name, static_cast<GLint>(level));
    });
}

void Framebuffer::attachLayer(Texture const &texture, unsigned int level, unsigned int layer,
                              AttachmentPoint point) {
    unsigned int const name = texture.checkedID();
    requireBound(kAttachUnbound);
    std::uint64_t const layers = LayersOf(texture, level);
    if (layer >= layers)
        ORU_THROW_INTERNAL("There is no layer ", layer, " in a texture of ", layers,
                           ": they count from 0, and textures without any are attached "
                           "by attachTexture");
    if (texture.target() == GL_TEXTURE_CUBE_MAP)
        return attachImage(point, GL_TEXTURE_CUBE_MAP_POSITIVE_X + layer, name, level);
    ORU_ASSERT_SUPPORTED(GL_ARB_FRAMEBUFFER_OBJECT);
    ForEachPoint(point, [&](GLenum attachment) {
        ORU_GL(FramebufferTextureLayer, target(), attachment, name, static_cast<GLint>(level),
               static_cast<GLint>(layer));
    });
}

void Framebuffer::attachRenderbuffer(Renderbuffer const &renderbuffer, AttachmentPoint point) {
    unsigned int const name = renderbuffer.checkedID();
    requireBound(kAttachUnbound);
    ForEachPoint(point, [&](GLenum attachment) {
        ORU_GL(FramebufferRenderbufferEXT, target(), attachment, GL_RENDERBUFFER_EXT, name);
    });
}

void Framebuffer::detachFrom(AttachmentPoint point) {
    requireBound(kDetachUnbound);
    ForEachPoint(point, [&](GLenum attachment) {
        ORU_GL(FramebufferRenderbufferEXT, target(), attachment, GL_RENDERBUFFER_EXT, 0);
    });
}

void Framebuffer::setDrawBuffers(std::initializer_list<AttachmentPoint> points) {
    requireBound("Framebuffer object must be bound before its draw and read buffers are set");
    ORU_ASSERT_SUPPORTED(GL_VERSION_2_0);
    std::vector<GLenum> buffers;
    for (AttachmentPoint const point : points)
        buffers.push_back(ColorBuffer(point));
    ORU_GL(DrawBuffers, static_cast<GLsizei>(buffers.size()), buffers.data());
}

void Framebuffer::setReadBuffer(AttachmentPoint point) {
    requireBound("Framebuffer object must be bound before its draw and read buffers are set");
    GLenum const buffer = ColorBuffer(point);
    // It is set for what is read, which need not be what is drawn into, and bound.
    if (internal::Supports(GL_ARB_FRAMEBUFFER_OBJECT)) {
        GLint read = 0;
        ORU_GL(GetIntegerv, GL_READ_FRAMEBUFFER_BINDING, &read);
        if (static_cast<unsigned int>(read) != objectID())
            ORU_THROW_INTERNAL("Another framebuffer is bound to be read from: bind() this one "
                               "before its read buffer is set");
    }
    ORU_GL(ReadBuffer, buffer);
}

void Framebuffer::detach(Texture2 *texture, unsigned int colorIndex) {
    ORU_ENFORCE_TEXT("poTex != NULL", texture);
    requireBound(kDetachUnbound);
    GLenum const attachment = ColorAttachment(colorIndex);
    ORU_GL(FramebufferTexture2DEXT, target(), attachment, texture->target(), 0, 0);
}

void Framebuffer::detach(Renderbuffer *renderbuffer, unsigned int colorIndex) {
    ORU_ENFORCE_TEXT("poBuffer != NULL", renderbuffer);
    requireBound(kDetachUnbound);
    GLenum const attachment = AttachmentFor(*renderbuffer, colorIndex);
    ORU_GL(FramebufferRenderbufferEXT, target(), attachment, GL_RENDERBUFFER_EXT, 0);
}

void Framebuffer::detach(unsigned int textureTarget, unsigned int framebufferTarget,
                         unsigned int colorIndex) {
    ORU_GL(FramebufferTexture2DEXT, framebufferTarget, GL_COLOR_ATTACHMENT0_EXT + colorIndex,
           textureTarget, 0, 0);
}

bool Framebuffer::statusOkay(unsigned int *status) const {
    requireBound("Framebuffer object must be bound before calling statusOkay()");
    GLenum const value = ORU_GL(CheckFramebufferStatusEXT, target());
    if (status)
        *status = value;
    return value == GL_FRAMEBUFFER_COMPLETE_EXT;
}

unsigned int Framebuffer::MaxColorAttachments() {
    GLint maximum = 0;
    ORU_GL(GetIntegerv, GL_MAX_COLOR_ATTACHMENTS_EXT, &maximum);
    return static_cast<unsigned int>(maximum);
}

bool Framebuffer::IsSupported() {
    return internal::Supports(GL_EXT_FRAMEBUFFER_OBJECT);
}

} // namespace ORU::OGL
