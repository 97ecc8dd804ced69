// The OpenCL kernels of develop.
#pragma once

#include <cstdint>

namespace Develop {

/// The unsharp mask of a texture that OpenCL and OpenGL share. OpenCL C 1.0. Pictures are float4 in
/// rows without gaps; `colours` is 1 for channels that hold colours, 0 for alpha.
extern char const *const kSharedKernels;

/// All steps from codes to codes. OpenCL C 1.0. To be defined:
/// SPAN, the pixels of a work item, and BITS of a channel, which some kernels are named after.
extern char const *const kDevelopKernels;

/// Their `Tile`, member by member.
struct KernelTile {
    std::int32_t width, height, channels, colours, reach, left, top, targetWidth, targetHeight, x,
        y, tables, levels, indices, steps, isLinear, becomesLinear, hasMatrix, spots;
    float amount, exposure, gain;
};

/// Their `Spot`.
struct KernelSpot {
    std::int32_t x, y;
    float restX, restY, radius, stops;
};

} // namespace Develop
