// Samplers: how shaders read whatever texture is on a unit.
#pragma once

#include "oru/oru_ogl/ogl/object.h"
#include "oru/oru_ogl/ogl/texture.h"

namespace ORU::OGL {

/// One sampler object. While it is bound to a unit, its parameters count there in place of those of
/// the texture. `isBound()` asks the active unit.
///
/// ```cpp
/// Sampler smooth(Texture::FILTER_LINEAR_MIPMAP_LINEAR, Texture::FILTER_LINEAR,
///                Texture::WRAPMODE_REPEAT);
/// SamplerBindScope const scope(smooth, 0);
/// ```
class ORU_API Sampler : public Object {
public:
    /// Makes a sampler; the other parameters are OpenGL's own.
    /// @param wrap in all directions
    /// @throws InternalException without OpenGL 3.3 or GL_ARB_sampler_objects
    /// @note glGenSamplers, glSamplerParameteri
    Sampler(Texture::Filter minification, Texture::Filter magnification, Texture::WrapMode wrap);

    /// A sampler that was made elsewhere. After a failure the name is the caller's as before.
    /// @throws InternalException without the extension, and for a name that is no sampler
    /// @note glIsSampler
    Sampler(unsigned int name, ownership_tag ownership);

    Sampler(Sampler &&other) noexcept = default;
    Sampler &operator=(Sampler &&other) noexcept;

    /// Deletes the sampler that the object owns. @note glDeleteSamplers
    ~Sampler() override;

    /// @name Parameters
    /// The sampler need not be bound. What they mean and refuse stands at Texture's of the same
    /// name.
    /// @note glSamplerParameteri, glSamplerParameterf, glSamplerParameterfv
    /// @{
    void setFilter(Texture::Filter minification, Texture::Filter magnification);
    /// @throws InternalException in a core context for WRAPMODE_CLAMP
    void setWrap(Texture::WrapMode s, Texture::WrapMode t, Texture::WrapMode r);
    /// @param rgba four components
    void setBorderColor(float const *rgba);
    void setMaxAnisotropy(float ratio);
    void setCompare(Texture::Compare compare);

    /// The mip levels that are used, as numbers that may lie between two levels.
    void setLevelOfDetailRange(float first, float last);

    /// A number of levels that is added before a level is chosen; more is coarser.
    void setLevelOfDetailBias(float levels);
    /// @}

    /// Binds the sampler to a unit, whichever is active.
    /// @param unit index of a texture unit
    /// @note glBindSampler
    void bind(unsigned int unit) const;

    /// Binds no sampler to a unit: the texture's parameters count again.
    /// @note glBindSampler
    static void BindDefault(unsigned int unit);

    /// OpenGL 3.3 or GL_ARB_sampler_objects.
    static bool IsSupported();

private:
    void set(unsigned int parameter, unsigned int value);
    void deleteObject() noexcept;
};

} // namespace ORU::OGL
