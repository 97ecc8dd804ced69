// Samplers: how shaders read whatever texture is on a unit.
#include "oru/oru_ogl/ogl/sampler.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"
#include "oru/oru_ogl/ogl/internal/textures/texturestorage.h"
#include "oru/oru_ogl/platformgl.h"

#include <utility>

namespace ORU::OGL {

Sampler::Sampler(Texture::Filter minification, Texture::Filter magnification,
                 Texture::WrapMode wrap)
    : Object(GL_SAMPLER, GL_SAMPLER_BINDING) {
    ORU_ASSERT_SUPPORTED(GL_ARB_SAMPLER_OBJECTS);
    try {
        ORU_GL(GenSamplers, 1, &objectID_);
        ORU_ASSERT(objectID_ != 0);
        setFilter(minification, magnification);
        setWrap(wrap, wrap, wrap);
    } catch (...) {
        deleteObject();
        throw;
    }
}

Sampler::Sampler(unsigned int name, ownership_tag ownership)
    : Object(GL_SAMPLER, GL_SAMPLER_BINDING, name, ownership) {
    ORU_ASSERT_SUPPORTED(GL_ARB_SAMPLER_OBJECTS);
    internal::RequireName(ORU_GL(IsSampler, name), name, "sampler");
}

Sampler &Sampler::operator=(Sampler &&other) noexcept {
    if (this != &other) {
        deleteObject();
        Object::operator=(std::move(other));
    }
    return *this;
}

Sampler::~Sampler() {
    deleteObject();
}

void Sampler::deleteObject() noexcept {
    if (ownsName())
        internal::Release([this] { ORU_GL(DeleteSamplers, 1, &objectID_); });
}

void Sampler::set(unsigned int parameter, unsigned int value) {
    ORU_GL(SamplerParameteri, checkedID(), parameter, static_cast<GLint>(value));
}

void Sampler::setFilter(Texture::Filter minification, Texture::Filter magnification) {
    set(GL_TEXTURE_MIN_FILTER, Texture::Filter2GL(minification));
    set(GL_TEXTURE_MAG_FILTER, Texture::Filter2GL(magnification));
}

void Sampler::setWrap(Texture::WrapMode s, Texture::WrapMode t, Texture::WrapMode r) {
    internal::RequireWrap(s, t, r);
    set(GL_TEXTURE_WRAP_S, Texture::WrapMode2GL(s));
    set(GL_TEXTURE_WRAP_T, Texture::WrapMode2GL(t));
    set(GL_TEXTURE_WRAP_R, Texture::WrapMode2GL(r));
}

void Sampler::setBorderColor(float const *rgba) {
    ORU_GL(SamplerParameterfv, checkedID(), GL_TEXTURE_BORDER_COLOR, rgba);
}

void Sampler::setMaxAnisotropy(float ratio) {
    internal::RequireAnisotropy(ratio);
    ORU_GL(SamplerParameterf, checkedID(), GL_TEXTURE_MAX_ANISOTROPY_EXT, ratio);
}

void Sampler::setCompare(Texture::Compare compare) {
    unsigned int const function = Texture::Compare2GL(compare);
    bool const compares = compare != Texture::COMPARE_NONE;
    set(GL_TEXTURE_COMPARE_MODE, compares ? GL_COMPARE_REF_TO_TEXTURE : GL_NONE);
    if (compares)
        set(GL_TEXTURE_COMPARE_FUNC, function);
}

void Sampler::setLevelOfDetailRange(float first, float last) {
    ORU_GL(SamplerParameterf, checkedID(), GL_TEXTURE_MIN_LOD, first);
    ORU_GL(SamplerParameterf, checkedID(), GL_TEXTURE_MAX_LOD, last);
}

void Sampler::setLevelOfDetailBias(float levels) {
    ORU_GL(SamplerParameterf, checkedID(), GL_TEXTURE_LOD_BIAS, levels);
}

void Sampler::bind(unsigned int unit) const {
    ORU_GL(BindSampler, unit, checkedID());
}

void Sampler::BindDefault(unsigned int unit) {
    ORU_GL(BindSampler, unit, 0);
}

bool Sampler::IsSupported() {
    return internal::Supports(GL_ARB_SAMPLER_OBJECTS);
}

} // namespace ORU::OGL
