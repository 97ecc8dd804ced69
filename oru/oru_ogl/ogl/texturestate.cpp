// The active texture unit of the current context, and what its textures can be.
#include "oru/oru_ogl/ogl/texturestate.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/texture.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {
namespace TextureState {

unsigned int ActiveTextureUnit() {
    GLint active = 0;
    ORU_GL(GetIntegerv, GL_ACTIVE_TEXTURE, &active);
    return static_cast<unsigned int>(active) - GL_TEXTURE0;
}

void SetActiveTextureUnit(unsigned int index) {
    ORU_GL(ActiveTexture, GL_TEXTURE0 + index);
}

bool IsTargetSupported(unsigned int target) {
    return Texture::IsTargetSupported(target);
}

bool SupportsNonPowerOfTwo() {
    return internal::CurrentRecord(&ExtensionManager::supportsNonPowerOfTwoTextures);
}

} // namespace TextureState
} // namespace ORU::OGL
