// Blending changed for a scope.
#include "oru/oru_ogl/ogl/blendscope.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

using internal::Release;

void BlendState::setToCurrentGLValues() {
    GLboolean isEnabled = GL_FALSE;
    ORU_GL(GetBooleanv, GL_BLEND, &isEnabled);
    enabled = isEnabled != GL_FALSE;
    ORU_GL(GetIntegerv, GL_BLEND_DST_ALPHA, &dstAlpha);
    ORU_GL(GetIntegerv, GL_BLEND_DST_RGB, &dstRGB);
    ORU_GL(GetIntegerv, GL_BLEND_SRC_ALPHA, &srcAlpha);
    ORU_GL(GetIntegerv, GL_BLEND_SRC_RGB, &srcRGB);
    ORU_GL(GetIntegerv, GL_BLEND_EQUATION_ALPHA, &equationAlpha);
    ORU_GL(GetIntegerv, GL_BLEND_EQUATION_RGB, &equationRGB);
    if (ORU_GL0(GetError) != GL_NO_ERROR)
        ORU_THROW_INTERNAL("glGetError() == GL_NO_ERROR");
}

TemporaryBlendScope::TemporaryBlendScope() {
    saved_.setToCurrentGLValues();
    current_ = saved_;
}

TemporaryBlendScope::~TemporaryBlendScope() {
    if (saved_.enabled != current_.enabled)
        Release([this] {
            if (saved_.enabled)
                ORU_GL(Enable, GL_BLEND);
            else
                ORU_GL(Disable, GL_BLEND);
        });
    if (saved_.dstAlpha != current_.dstAlpha || saved_.dstRGB != current_.dstRGB ||
        saved_.srcAlpha != current_.srcAlpha || saved_.srcRGB != current_.srcRGB)
        Release([this] {
            ORU_GL(BlendFuncSeparate, static_cast<GLenum>(saved_.srcRGB),
                   static_cast<GLenum>(saved_.dstRGB), static_cast<GLenum>(saved_.srcAlpha),
                   static_cast<GLenum>(saved_.dstAlpha));
        });
    if (saved_.equationAlpha != current_.equationAlpha ||
        saved_.equationRGB != current_.equationRGB)
        Release([this] {
            ORU_GL(BlendEquationSeparate, static_cast<GLenum>(saved_.equationRGB),
                   static_cast<GLenum>(saved_.equationAlpha));
        });
    Release([] { ORU_GL0(GetError); });
}

TemporaryAlphaBlendScope::TemporaryAlphaBlendScope() {
    // What the calls will set: when one of them fails, the base puts it back.
    current_.enabled = true;
    current_.srcRGB = current_.srcAlpha = GL_SRC_ALPHA;
    current_.dstRGB = current_.dstAlpha = GL_ONE_MINUS_SRC_ALPHA;
    current_.equationRGB = current_.equationAlpha = GL_FUNC_ADD;
    ORU_GL(Enable, GL_BLEND);
    ORU_GL(BlendFunc, GL_SRC_ALPHA, GL_ONE_MINUS_SRC_ALPHA);
    ORU_GL(BlendEquation, GL_FUNC_ADD);
    current_.setToCurrentGLValues();
}

TemporaryAlphaBlendScope::~TemporaryAlphaBlendScope() = default;

} // namespace ORU::OGL
