// The OpenCL kernels of the unsharp mask.
#pragma once

namespace Develop {

/// OpenCL C 1.0. Pictures are float4 in rows without gaps; `colours` is 1 for channels that hold
/// colours, 0 for alpha.
extern char const *const kSharpenKernels;

} // namespace Develop
