// Textures with several samples a texel, to draw into.
#pragma once

#include "oru/oru_ogl/ogl/texture.h"

namespace ORU::OGL {

/// GL_TEXTURE_2D_MULTISAMPLE: attach it to a Framebuffer, draw, and resolve it by
/// `Framebuffer::Resolve`, or read its samples by `texelFetch` of a sampler2DMS. It has no levels,
/// filters, wrapping or transfers.
class ORU_API Texture2DMultisample : public Texture {
public:
    /// Makes the texture and its storage. What was bound to the target stays bound.
    /// @param width, height texels
    /// @param samples of a texel, from 1 to `MaxSamples()`; OpenGL may take more, see `samples()`
    /// @param fixedLocations whether all texels have their samples in the same places, as they must
    ///        where textures and renderbuffers are attached side by side
    /// @throws InternalException without OpenGL 3.2 or GL_ARB_texture_multisample, and for another
    ///         number of samples; ExceptionOGL when OpenGL refuses size or format
    /// @note glTexImage2DMultisample
    Texture2DMultisample(InternalFormat format, std::uint64_t width, std::uint64_t height,
                         unsigned int samples, bool fixedLocations = true);

    /// A texture that was made elsewhere. Failures as Texture2D's.
    Texture2DMultisample(unsigned int name, ownership_tag ownership);

    Texture2DMultisample(Texture2DMultisample &&other) noexcept = default;
    Texture2DMultisample &operator=(Texture2DMultisample &&other) noexcept = default;
    ~Texture2DMultisample() override;

    /// How many samples a texel has.
    unsigned int samples() const {
        requireObject();
        return samples_;
    }

    /// The most samples of a format of colours; integers and depth may have fewer.
    /// @throws InternalException where there are no such textures
    /// @note glGetIntegerv
    static unsigned int MaxSamples();

    /// OpenGL 3.2 or GL_ARB_texture_multisample.
    static bool IsSupported();

private:
    void readSamples();

    unsigned int samples_ = 0;
};

} // namespace ORU::OGL
