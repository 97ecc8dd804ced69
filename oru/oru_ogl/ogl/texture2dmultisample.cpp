// Textures with several samples a texel, to draw into.
#include "oru/oru_ogl/ogl/texture2dmultisample.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/textures/texturestorage.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

Texture2DMultisample::Texture2DMultisample(InternalFormat format, std::uint64_t width,
                                           std::uint64_t height, unsigned int samples,
                                           bool fixedLocations)
    : Texture(TARGET_TEXTURE_2D_MULTISAMPLE, TARGETBINDING_TEXTURE_BINDING_2D_MULTISAMPLE, format,
              width, height, 1) {
    unsigned int const most = MaxSamples();
    if (samples < 1 || samples > most)
        ORU_THROW_INTERNAL("A texel cannot have ", samples, " samples: ask for 1 to ", most);
    internal::BoundObjectScope bound(*this, ORU_BINDER(BindTexture));
    auto const sides = internal::ToSides(width, height);
    ORU_GL(TexImage2DMultisample, target(), static_cast<GLsizei>(samples),
           InternalFormat2GL(format), sides[0], sides[1], static_cast<GLboolean>(fixedLocations));
    readSamples();
    bound.restore();
}

Texture2DMultisample::Texture2DMultisample(unsigned int name, ownership_tag ownership)
    : Texture(TARGET_TEXTURE_2D_MULTISAMPLE, TARGETBINDING_TEXTURE_BINDING_2D_MULTISAMPLE, name,
              ownership) {
    try {
        internal::BoundObjectScope bound(*this, ORU_BINDER(BindTexture));
        readSamples();
        bound.restore();
    } catch (...) {
        disown(); // the name is the caller's still, and the base's destructor would delete it
        throw;
    }
}

Texture2DMultisample::~Texture2DMultisample() = default;

void Texture2DMultisample::readSamples() {
    GLint samples = 0;
    ORU_GL(GetTexLevelParameteriv, target(), 0, GL_TEXTURE_SAMPLES, &samples);
    samples_ = static_cast<unsigned int>(samples);
}

unsigned int Texture2DMultisample::MaxSamples() {
    ORU_ASSERT_SUPPORTED(GL_ARB_TEXTURE_MULTISAMPLE);
    GLint most = 0;
    ORU_GL(GetIntegerv, GL_MAX_COLOR_TEXTURE_SAMPLES, &most);
    return static_cast<unsigned int>(most);
}

bool Texture2DMultisample::IsSupported() {
    return internal::Supports(GL_ARB_TEXTURE_MULTISAMPLE);
}

} // namespace ORU::OGL
