// The GLSL programs of develop.
#pragma once

#include <array>
#include <cstddef>
#include <string>

namespace ORU::OGL {
class Program;
} // namespace ORU::OGL

namespace Develop {

/// Vertices whose attribute `position` is in clip coordinates.
extern char const *const kCoverVertexShader;

/// What a developing pass does.
enum class Steps { Decode, Encode, DecodeAndEncode };

/// From codes to linear light, and from there, brightened, in another colour space and clamped, to
/// codes.
std::string DevelopShader(Steps steps);

/// Unsharp mask, first and second pass.
extern char const *const kBlurRowsShader;
extern char const *const kSharpenColumnsShader;

/// The exposure that a spot adds at each pixel.
extern char const *const kSpotVertexShader;
extern char const *const kSpotShader;

/// The first line of a shader for the current context.
std::string ShadingLanguageLine();

/// 1 for the channels of a texel that hold colours, 0 for alpha.
/// @param channels of the picture
std::array<float, 4> ColourMask(std::size_t channels);

/// Sets the uniform `colours` of the current program to the mask.
void SetColourMask(ORU::OGL::Program &program, std::size_t channels);

} // namespace Develop
