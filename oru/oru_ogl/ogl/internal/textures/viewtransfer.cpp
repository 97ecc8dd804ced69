// Transfers of pixels that know how much memory they have.
#include "oru/oru_ogl/ogl/internal/textures/viewtransfer.h"

#include "oru/core/utility/composetext.h"

#include <algorithm>

namespace ORU::OGL::internal {

void CheckSides(PixelShape const &pixels, std::size_t sides) {
    if ((sides < 3 && pixels.depth != 1) || (sides < 2 && pixels.height != 1))
        ORU_THROW_INTERNAL(ComposeText("Pixels of ", pixels.width, " x ", pixels.height, " x ",
                                       pixels.depth,
                                       " have more sides than the texture, which has ", sides));
}

void CheckLevel(Texture const &texture, PixelShape const &pixels, int level, std::uint64_t width,
                std::uint64_t height, std::uint64_t depth) {
    if (!texture.isBound())
        ORU_THROW_INTERNAL("Texture must be bound");
    if (level < 0)
        ORU_THROW_INTERNAL("a negative texture image mip-map level supplied");
    RequireSameKind(texture.format(), pixels.format);
    std::uint64_t const one = 1;
    width = std::max(width, one);
    height = std::max(height, one);
    depth = std::max(depth, one);
    // OpenGL writes the whole level, whatever room there is.
    if (pixels.width != width || pixels.height != height || pixels.depth != depth)
        ORU_THROW_INTERNAL(ComposeText("Level ", level, " has ", width, " x ", height, " x ", depth,
                                       " texels and is read as a whole: the pixels are ",
                                       pixels.width, " x ", pixels.height, " x ", pixels.depth));
}

void ReadLevel(GLenum image, int level, PixelShape const &shape, void *pixels) {
    PixelLayout const layout = LayoutOf(shape.format, shape.type);
    WithPackState(shape,
                  [&] { ORU_GL(GetTexImage, image, level, layout.format, layout.type, pixels); });
}

} // namespace ORU::OGL::internal
