// What the texture constructors share: the arithmetic of sizes and mip levels.
#pragma once

#include "oru/core/utility/boundary.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/texture.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <limits>

namespace ORU::OGL::internal {

/// Sizes as OpenGL takes them; one that does not fit becomes negative, which OpenGL refuses.
template<class... Sizes>
std::array<GLsizei, sizeof...(Sizes)> ToSides(Sizes... sizes) {
    constexpr std::uint64_t kLargest = std::numeric_limits<GLsizei>::max();
    return {(sizes <= kLargest ? static_cast<GLsizei>(sizes) : -1)...};
}

/// Whether sizes, in their low 32 bits, are all powers of two or 0.
template<class... Sizes>
bool ArePowersOfTwo(Sizes... sizes) {
    return (IsPowerOfTwo(static_cast<unsigned>(sizes)) && ...);
}

/// How a new texture is clamped: to its edges, where the current context can.
inline Texture::WrapMode NewTextureClamp() {
    return CurrentRecord(&ExtensionManager::supportsClampToEdge) ? Texture::WRAPMODE_CLAMP_TO_EDGE
                                                                 : Texture::WRAPMODE_CLAMP;
}

/// @throws InternalException in a core context for a wrap mode that it lacks
template<class... Modes>
void RequireWrap(Modes... modes) {
    if (((modes == Texture::WRAPMODE_CLAMP) || ...) && IsCoreContext())
        ORU_THROW_INTERNAL("WRAPMODE_CLAMP needs a compatibility context: in a core one use "
                           "WRAPMODE_CLAMP_TO_EDGE");
}

/// Calls `allocate(level, sides)` for level 0 and, with mipmaps, for all levels below it.
/// @param sides texels of level 0 in each direction
/// @param halved how many of the sides get smaller from level to level, the layers of an array not
/// @param mipmapped whether there is more than level 0
template<std::size_t Sides, class Allocate>
void ForEachLevel(std::array<GLsizei, Sides> sides, std::size_t halved, bool mipmapped,
                  Allocate allocate) {
    for (GLint level = 0;; ++level) {
        allocate(level, sides);
        if (!mipmapped)
            return;
        GLsizei remaining = 0;
        for (std::size_t i = 0; i < halved; ++i) {
            sides[i] >>= 1;
            remaining |= sides[i];
        }
        if (remaining == 0)
            return;
        for (std::size_t i = 0; i < halved; ++i)
            sides[i] = std::max(sides[i], 1);
    }
}

} // namespace ORU::OGL::internal
