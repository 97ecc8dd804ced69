// How pictures lie in textures.
#include "apps/develop/pixelformat.h"

namespace Develop {

using ORU::OGL::Texture;

PixelFormat PixelFormat::Of(App::Shape const &shape) {
    struct Row {
        Texture::InternalFormat storage8, storage16;
        Texture::Format layout;
    };
    static constexpr Row kRows[] = {
        {Texture::INTERNALFORMAT_RED, Texture::INTERNALFORMAT_R16, Texture::FORMAT_RED},
        {Texture::INTERNALFORMAT_RG, Texture::INTERNALFORMAT_RG16, Texture::FORMAT_RG},
        {Texture::INTERNALFORMAT_RGBA8, Texture::INTERNALFORMAT_RGBA16, Texture::FORMAT_RGB},
        {Texture::INTERNALFORMAT_RGBA8, Texture::INTERNALFORMAT_RGBA16, Texture::FORMAT_RGBA}};
    Row const &row = kRows[shape.channels - 1];
    if (shape.bitsPerChannel == 16)
        return {row.storage16, row.layout, Texture::TYPE_UNSIGNED_SHORT};
    return {row.storage8, row.layout, Texture::TYPE_UNSIGNED_BYTE};
}

} // namespace Develop
