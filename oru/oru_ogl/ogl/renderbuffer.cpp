// Renderbuffers: storage to render into that no shader reads.
#include "oru/oru_ogl/ogl/renderbuffer.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/platformgl.h"

#include <utility>

namespace ORU::OGL {

namespace {

/// The first of GL_EXT_framebuffer_object's five values for stencil indices; it has no name there.
constexpr GLenum kFirstStencilIndex = 0x8D45;

GLenum AttachmentOf(GLenum format) {
    switch (format) {
    case GL_DEPTH_COMPONENT:
    case GL_DEPTH_COMPONENT16:
    case GL_DEPTH_COMPONENT24:
    case GL_DEPTH_COMPONENT32:
    case GL_DEPTH_STENCIL_EXT:
        return GL_DEPTH_ATTACHMENT_EXT;
    case kFirstStencilIndex:
    case GL_STENCIL_INDEX1_EXT:
    case GL_STENCIL_INDEX4_EXT:
    case GL_STENCIL_INDEX8_EXT:
    case GL_STENCIL_INDEX16_EXT:
        return GL_STENCIL_ATTACHMENT_EXT;
    default:
        return GL_COLOR_ATTACHMENT0_EXT;
    }
}

} // namespace

Renderbuffer::Renderbuffer(unsigned int format, int width, int height)
    : Renderbuffer(format, width, height, 0) {}

Renderbuffer::Renderbuffer(unsigned int format, int width, int height, int samples)
    : Object(GL_RENDERBUFFER_EXT, GL_RENDERBUFFER_BINDING_EXT), format_(format),
      attachment_(AttachmentOf(format)), width_(width), height_(height) {
    ORU_ASSERT_SUPPORTED(GL_EXT_FRAMEBUFFER_OBJECT);
    int const maximum = MaxSize();
    if (width > maximum)
        ORU_THROW_INTERNAL("Can't create renderbuffer of width ", width, ", a max width of ",
                           maximum, " is supported");
    if (height > maximum) // the check's text is what hosts see, with its "width"
        ORU_THROW_INTERNAL("Can't create renderbuffer of width ", height, ", a max height of ",
                           maximum, " is supported");
    if (samples != 0) {
        ORU_ASSERT_SUPPORTED(GL_ARB_FRAMEBUFFER_OBJECT);
        int const most = MaxSamples();
        if (samples < 0 || samples > most)
            ORU_THROW_INTERNAL("Can't create renderbuffer of ", samples, " samples, at most ", most,
                               " are supported");
    }
    try {
        ORU_GL(GenRenderbuffersEXT, 1, &objectID_);
        makeStorage(samples);
    } catch (...) {
        deleteObject();
        throw;
    }
}

void Renderbuffer::makeStorage(int samples) {
    internal::BoundObjectScope bound(*this, ORU_BINDER(BindRenderbufferEXT));
    if (samples == 0)
        ORU_GL(RenderbufferStorageEXT, target(), format_, width_, height_);
    else
        ORU_GL(RenderbufferStorageMultisample, target(), samples, format_, width_, height_);
    ORU_ASSERT(objectID_ != 0);
    unbind();
    bound.restore();
}

Renderbuffer::Renderbuffer(unsigned int name, ownership_tag ownership)
    : Object(GL_RENDERBUFFER_EXT, GL_RENDERBUFFER_BINDING_EXT, name, ownership) {
    ORU_ASSERT_SUPPORTED(GL_EXT_FRAMEBUFFER_OBJECT);
    internal::RequireName(ORU_GL(IsRenderbufferEXT, name), name, "renderbuffer");
    internal::BoundObjectScope bound(*this, ORU_BINDER(BindRenderbufferEXT));
    auto const parameter = [this](GLenum query) {
        GLint value = 0;
        ORU_GL(GetRenderbufferParameterivEXT, target(), query, &value);
        return value;
    };
    format_ = static_cast<unsigned int>(parameter(GL_RENDERBUFFER_INTERNAL_FORMAT_EXT));
    attachment_ = AttachmentOf(format_);
    width_ = parameter(GL_RENDERBUFFER_WIDTH_EXT);
    height_ = parameter(GL_RENDERBUFFER_HEIGHT_EXT);
    bound.restore();
}

Renderbuffer &Renderbuffer::operator=(Renderbuffer &&other) noexcept {
    if (this == &other)
        return *this;
    deleteObject();
    format_ = other.format_;
    attachment_ = other.attachment_;
    width_ = other.width_;
    height_ = other.height_;
    Object::operator=(std::move(other));
    return *this;
}

Renderbuffer::~Renderbuffer() {
    deleteObject();
}

void Renderbuffer::deleteObject() noexcept {
    if (ownsName())
        internal::Release([this] { ORU_GL(DeleteRenderbuffersEXT, 1, &objectID_); });
}

void Renderbuffer::bind() {
    ORU_GL(BindRenderbufferEXT, target(), objectID_);
}

void Renderbuffer::unbind() {
    if (!isBound()) // the check's text is what hosts see
        ORU_THROW_INTERNAL("Framebuffer object must be bound before calling unbind()");
    ORU_GL(BindRenderbufferEXT, target(), 0);
}

int Renderbuffer::MaxSize() {
    GLint maximum = 0;
    ORU_GL(GetIntegerv, GL_MAX_RENDERBUFFER_SIZE_EXT, &maximum);
    return maximum;
}

int Renderbuffer::MaxSamples() {
    GLint most = 0;
    ORU_GL(GetIntegerv, GL_MAX_SAMPLES, &most);
    return most;
}

bool Renderbuffer::IsSupported() {
    return internal::Supports(GL_EXT_FRAMEBUFFER_OBJECT);
}

} // namespace ORU::OGL
