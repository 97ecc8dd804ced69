// The active texture unit of the current context, and what its textures can be.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {
/// The active texture unit, and what textures of the current context can be.
namespace TextureState {

/// Index of the active unit, counted from 0. @note glGetIntegerv; needs OpenGL 1.3
ORU_API unsigned int ActiveTextureUnit();

/// Makes a unit the active one.
/// @throws ExceptionOGL for an index beyond the context's units
/// @note glActiveTexture; needs OpenGL 1.3
ORU_API void SetActiveTextureUnit(unsigned int index);

/// The answer of Texture::IsTargetSupported.
ORU_API bool IsTargetSupported(unsigned int target);

/// Whether textures of the current context may be of any size.
ORU_API bool SupportsNonPowerOfTwo();

} // namespace TextureState
} // namespace ORU::OGL
