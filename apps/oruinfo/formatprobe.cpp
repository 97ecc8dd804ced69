// Tries what can be done with internal formats.
#include "apps/oruinfo/formatprobe.h"

#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/platformgl.h"

namespace OruInfo {

using namespace ORU::OGL;

namespace {

/// The name of an object that goes with its scope.
class ScopedTexture {
public:
    ScopedTexture() { ORU_GL(GenTextures, 1, &name_); }
    ~ScopedTexture() {
        ORU::DropExceptions([this] { ORU_GL(DeleteTextures, 1, &name_); });
    }
    ScopedTexture(ScopedTexture const &) = delete;
    ScopedTexture &operator=(ScopedTexture const &) = delete;

    GLuint name() const { return name_; }

private:
    GLuint name_ = 0;
};

class ScopedRenderbuffer {
public:
    ScopedRenderbuffer() { ORU_GL(GenRenderbuffersEXT, 1, &name_); }
    ~ScopedRenderbuffer() {
        ORU::DropExceptions([this] { ORU_GL(DeleteRenderbuffersEXT, 1, &name_); });
    }
    ScopedRenderbuffer(ScopedRenderbuffer const &) = delete;
    ScopedRenderbuffer &operator=(ScopedRenderbuffer const &) = delete;

    GLuint name() const { return name_; }

private:
    GLuint name_ = 0;
};

/// Whether OpenGL takes the calls; other failures pass.
template<class Calls>
bool Accepts(Calls const &calls) {
    try {
        calls();
        return true;
    } catch (ExceptionOGL const &refusal) {
        if (refusal.errorNumber() == 0) // there is no such function
            throw;
        return false;
    }
}

bool HasStencil(GLenum format) {
    return format == GL_DEPTH24_STENCIL8 || format == GL_DEPTH32F_STENCIL8;
}

GLenum AttachmentOf(GLenum format) {
    return FormatProbe::HasDepth(format) ? GL_DEPTH_ATTACHMENT_EXT : GL_COLOR_ATTACHMENT0_EXT;
}

} // namespace

FormatProbe::FormatProbe() : shown_(Texture::INTERNALFORMAT_RGBA8, 2, 1, false) {
    framebuffer_.bind();
    ORU_GL(Viewport, 0, 0, 2, 1);
    ORU_GL(TexEnvi, GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, GL_REPLACE);
}

bool FormatProbe::HasDepth(GLenum format) {
    return HasStencil(format) || format == GL_DEPTH_COMPONENT16 || format == GL_DEPTH_COMPONENT24 ||
           format == GL_DEPTH_COMPONENT32 || format == GL_DEPTH_COMPONENT32F;
}

FormatAnswers FormatProbe::ask(GLenum format) {
    FormatAnswers answers;
    ScopedTexture const texture;
    ORU_GL(BindTexture, GL_TEXTURE_2D, texture.name());
    answers.isTexture = makesTexture(format);
    if (!answers.isTexture)
        return answers;
    detachAll();
    answers.isRenderable = Accepts([&] {
                               ORU_GL(FramebufferTexture2DEXT, GL_FRAMEBUFFER_EXT,
                                      AttachmentOf(format), GL_TEXTURE_2D, texture.name(), 0);
                           }) &&
                           isComplete(format);
    answers.isFiltered = !HasDepth(format) && isFiltered(texture.name());
    answers.samples = mostSamples(format);
    return answers;
}

/// Two texels, black and white.
bool FormatProbe::makesTexture(GLenum format) const {
    GLfloat const texels[] = {0, 0, 0, 0, 1, 1, 1, 1};
    GLenum const pixels = HasStencil(format) ? GL_DEPTH_STENCIL
                          : HasDepth(format) ? GL_DEPTH_COMPONENT
                                             : GL_RGBA;
    GLenum const type = format == GL_DEPTH24_STENCIL8    ? GL_UNSIGNED_INT_24_8
                        : format == GL_DEPTH32F_STENCIL8 ? GL_FLOAT_32_UNSIGNED_INT_24_8_REV
                                                         : GL_FLOAT;
    return Accepts([&] {
        ORU_GL(TexImage2D, GL_TEXTURE_2D, 0, static_cast<GLint>(format), 2, 1, 0, pixels, type,
               texels);
        ORU_GL(TexParameteri, GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_LINEAR);
        ORU_GL(TexParameteri, GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_LINEAR);
    });
}

/// Whether what is attached can be drawn into. A framebuffer of depths only is told so.
bool FormatProbe::isComplete(GLenum format) {
    GLenum const buffer = HasDepth(format) ? GL_NONE : GL_COLOR_ATTACHMENT0_EXT;
    ORU_GL(DrawBuffer, buffer);
    ORU_GL(ReadBuffer, buffer);
    return framebuffer_.statusOkay(nullptr);
}

/// The middle of the two texels is seen everywhere: grey when it is filtered.
bool FormatProbe::isFiltered(GLuint texture) {
    detachAll();
    framebuffer_.attach(shown_.objectID(), GL_TEXTURE_2D, 0, 0);
    ORU_GL(DrawBuffer, GL_COLOR_ATTACHMENT0_EXT);
    ORU_GL(ReadBuffer, GL_COLOR_ATTACHMENT0_EXT);
    ORU_GL(BindTexture, GL_TEXTURE_2D, texture);
    ORU_GL(Enable, GL_TEXTURE_2D);
    ORU_GL(TexCoord2f, 0.5f, 0.5f);
    ORU_GL(Rectf, -1, -1, 1, 1);
    ORU_GL(Disable, GL_TEXTURE_2D);
    GLubyte pixel[4] = {};
    ORU_GL(ReadPixels, 0, 0, 1, 1, GL_RGBA, GL_UNSIGNED_BYTE, pixel);
    for (GLubyte const channel : pixel)
        if (channel > 64 && channel < 191)
            return true;
    return false;
}

bool FormatProbe::isMultisampled(GLenum format, GLuint renderbuffer, int samples) {
    auto const makeStorage = [&] {
        if (ExtensionManager::Instance()->isSupported(GL_EXT_FRAMEBUFFER_MULTISAMPLE))
            ORU_GL(RenderbufferStorageMultisampleEXT, GL_RENDERBUFFER_EXT, samples, format, 2, 1);
        else
            ORU_GL(RenderbufferStorageMultisample, GL_RENDERBUFFER_EXT, samples, format, 2, 1);
        ORU_GL(FramebufferRenderbufferEXT, GL_FRAMEBUFFER_EXT, AttachmentOf(format),
               GL_RENDERBUFFER_EXT, renderbuffer);
    };
    return Accepts(makeStorage) && isComplete(format);
}

unsigned int FormatProbe::mostSamples(GLenum format) {
    ExtensionManager const &record = *ExtensionManager::Instance();
    if (!record.isSupported(GL_EXT_FRAMEBUFFER_MULTISAMPLE) &&
        !record.isSupported(GL_ARB_FRAMEBUFFER_OBJECT))
        return 0;
    GLint samples = 0;
    ORU_GL(GetIntegerv, GL_MAX_SAMPLES, &samples);
    for (; samples > 1; samples /= 2) {
        ScopedRenderbuffer const renderbuffer;
        ORU_GL(BindRenderbufferEXT, GL_RENDERBUFFER_EXT, renderbuffer.name());
        detachAll();
        if (isMultisampled(format, renderbuffer.name(), samples))
            return static_cast<unsigned int>(samples);
    }
    return 0;
}

void FormatProbe::detachAll() const {
    for (GLenum const point : {GLenum{GL_COLOR_ATTACHMENT0_EXT}, GLenum{GL_DEPTH_ATTACHMENT_EXT}})
        ORU_GL(FramebufferTexture2DEXT, GL_FRAMEBUFFER_EXT, point, GL_TEXTURE_2D, 0, 0);
}

} // namespace OruInfo
