// How pictures lie in textures.
#include "apps/develop/pixelformat.h"

namespace Develop {

using ORU::OGL::Texture;

PixelFormat PixelFormat::Of(App::Shape const &shape) {
    struct Row {
        Texture::InternalFormat storage8, storage16, storage32;
        Texture::Format layout;
        unsigned int glLayout;
    };
    static constexpr Row kRows[] = {
        {Texture::INTERNALFORMAT_RED, Texture::INTERNALFORMAT_R16, Texture::INTERNALFORMAT_R32F,
         Texture::FORMAT_RED, GL_RED},
        {Texture::INTERNALFORMAT_RG, Texture::INTERNALFORMAT_RG16, Texture::INTERNALFORMAT_RG32F,
         Texture::FORMAT_RG, GL_RG},
        {Texture::INTERNALFORMAT_RGBA8, Texture::INTERNALFORMAT_RGBA16,
         Texture::INTERNALFORMAT_RGBA32F_ARB, Texture::FORMAT_RGB, GL_RGB},
        {Texture::INTERNALFORMAT_RGBA8, Texture::INTERNALFORMAT_RGBA16,
         Texture::INTERNALFORMAT_RGBA32F_ARB, Texture::FORMAT_RGBA, GL_RGBA}};
    Row const &row = kRows[shape.channels - 1];
    switch (shape.bitsPerChannel) {
    case 8:
        return {row.storage8, row.layout, Texture::TYPE_UNSIGNED_BYTE, row.glLayout,
                GL_UNSIGNED_BYTE};
    case 16:
        return {row.storage16, row.layout, Texture::TYPE_UNSIGNED_SHORT, row.glLayout,
                GL_UNSIGNED_SHORT};
    default:
        return {row.storage32, row.layout, Texture::TYPE_FLOAT, row.glLayout, GL_FLOAT};
    }
}

} // namespace Develop
