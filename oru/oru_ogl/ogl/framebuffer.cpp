// Framebuffers: what is drawn into instead of a window.
#include "oru/oru_ogl/ogl/framebuffer.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "oru/oru_ogl/platformgl.h"

#include <utility>

namespace ORU::OGL {

namespace {

constexpr char kAttachUnbound[] = "Framebuffer Objects must be bound to attach objects";
constexpr char kDetachUnbound[] = "Framebuffer Object must be bound before detaching objects";

/// The attachment point of a colour index, which must exist.
GLenum ColorAttachment(unsigned int colorIndex) {
    unsigned int const maximum = Framebuffer::MaxColorAttachments();
    if (colorIndex >= maximum)
        ORU_THROW_INTERNAL(ComposeText("Invalid color buffer attachment only ", maximum,
                                       " attachments supported with ", colorIndex, " requested"));
    return GL_COLOR_ATTACHMENT0_EXT + colorIndex;
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
        ORU_THROW_INTERNAL(ComposeText("Color buffer index is not supported with attachment:",
                                       ORUOGLTokenName(attachment)));
    return attachment + colorIndex;
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
