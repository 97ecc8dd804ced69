// How pictures lie in textures.
#pragma once

#include "apps/common/image.h"

#include "oru/oru_ogl/ogl/texture.h"
#include "oru/oru_ogl/platformgl.h"

namespace Develop {

/// The texture format that holds pixels exactly, and how they lie in memory.
struct PixelFormat {
    ORU::OGL::Texture::InternalFormat storage;
    ORU::OGL::Texture::Format layout;
    ORU::OGL::Texture::Type type;
    unsigned int glLayout, glType; ///< the same for OpenGL itself

    /// Every format can be drawn into, hence four channels for RGB.
    static PixelFormat Of(App::Shape const &shape);
};

/// Linear light of every kind of picture. Four channels of floats are what every OpenGL draws into
/// and every OpenCL shares.
constexpr PixelFormat kLightFormat = {ORU::OGL::Texture::INTERNALFORMAT_RGBA32F_ARB,
                                      ORU::OGL::Texture::FORMAT_RGBA, ORU::OGL::Texture::TYPE_FLOAT,
                                      GL_RGBA, GL_FLOAT};

/// Bytes of a pixel of linear light.
constexpr std::size_t kLightBytes = 4 * sizeof(float);

} // namespace Develop
