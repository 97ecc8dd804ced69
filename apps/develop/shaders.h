// The GLSL programs of develop.
#pragma once

#include <string>

namespace Develop {

/// The vertex shader of every pass: its attribute `position` covers the target.
extern char const *const cCoverVertexShader;

/// sRGB to linear light, times 2^exposure, clamped, and back to sRGB.
extern char const *const cDevelopShader;

/// The first line of a shader for the current context.
std::string ShadingLanguageLine();

} // namespace Develop
