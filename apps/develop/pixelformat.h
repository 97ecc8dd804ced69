// How pictures lie in textures.
#pragma once

#include "apps/common/image.h"

#include "oru/oru_ogl/ogl/texture.h"

namespace Develop {

/// The texture format that holds pixels exactly, and how they lie in memory.
struct PixelFormat {
    ORU::OGL::Texture::InternalFormat storage;
    ORU::OGL::Texture::Format layout;
    ORU::OGL::Texture::Type type;

    /// Every format can be drawn into, hence four channels for RGB.
    static PixelFormat Of(App::Shape const &shape);
};

} // namespace Develop
