// What the texture constructors share: the arithmetic of sizes and mip levels.
#pragma once

#include "oru/core/utility/boundary.h"
#include "oru/oru_ogl/gltypes.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <limits>

namespace ORU::OGL::internal {

/// A size as OpenGL takes it; one that does not fit becomes negative, which OpenGL refuses.
inline GLsizei ToGLsizei(std::uint64_t size) {
    constexpr std::uint64_t largest = std::numeric_limits<GLsizei>::max();
    return size <= largest ? static_cast<GLsizei>(size) : -1;
}

/// Whether a size, in its low 32 bits, is a power of two or 0.
inline bool IsPowerOfTwoSize(std::uint64_t size) {
    return IsPowerOfTwo(static_cast<unsigned>(size));
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
