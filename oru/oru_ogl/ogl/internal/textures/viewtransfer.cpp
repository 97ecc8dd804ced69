// Transfers of pixels that know how much memory they have.
#include "oru/oru_ogl/ogl/internal/textures/viewtransfer.h"

#include "oru/core/utility/composetext.h"

#include <algorithm>

namespace ORU::OGL::internal {

void CheckSides(PixelShape const &pixels, std::size_t sides) {
    if ((sides < 3 && pixels.depth != 1) || (sides < 2 && pixels.height != 1))
        ORU_THROW_INTERNAL("Pixels of ", pixels.width, " x ", pixels.height, " x ", pixels.depth,
                           " have more sides than the texture, which has ", sides);
}

void CheckLevel(Texture const &texture, GLenum image, PixelShape const &pixels, int level) {
    if (!texture.isBound())
        ORU_THROW_INTERNAL("Texture must be bound");
    if (level < 0)
        ORU_THROW_INTERNAL("a negative texture image mip-map level supplied");
    RequireSameKind(texture.format(), pixels.format);
    // OpenGL writes the whole level, whatever room there is, and alone knows how large it is: other
    // code may have made it, each level and face of any size.
    auto const side = [&](GLenum parameter) {
        GLint texels = 0;
        ORU_GL(GetTexLevelParameteriv, image, level, parameter, &texels);
        return static_cast<std::uint64_t>(texels);
    };
    std::uint64_t const width = side(GL_TEXTURE_WIDTH), height = side(GL_TEXTURE_HEIGHT),
                        depth = CurrentRecord(&ExtensionManager::supportsTexture3D)
                                    ? side(GL_TEXTURE_DEPTH)
                                    : std::min<std::uint64_t>(width, 1);
    if (pixels.width != width || pixels.height != height || pixels.depth != depth)
        ORU_THROW_INTERNAL("Level ", level, " has ", width, " x ", height, " x ", depth,
                           " texels and is read as a whole: the pixels are ", pixels.width, " x ",
                           pixels.height, " x ", pixels.depth);
}

void ReadBlocks(GLenum image, int level, void *pixels, std::size_t bytes) {
    GLint there = 0;
    ORU_GL(GetTexLevelParameteriv, image, level, GL_TEXTURE_COMPRESSED_IMAGE_SIZE, &there);
    if (static_cast<std::size_t>(there) != bytes) // other code may have made it, of any size
        ORU_THROW_INTERNAL("OpenGL has ", there, " bytes of blocks in level ", level, ", not ",
                           bytes);
    WithPackState(PixelShape(), [&] { ORU_GL(GetCompressedTexImage, image, level, pixels); });
}

void ReadLevel(GLenum image, int level, PixelShape const &shape, void *pixels) {
    PixelLayout const layout = LayoutOf(shape.format, shape.type);
    WithPackState(shape,
                  [&] { ORU_GL(GetTexImage, image, level, layout.format, layout.type, pixels); });
}

} // namespace ORU::OGL::internal
