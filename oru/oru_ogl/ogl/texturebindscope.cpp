// Texturing with one 2-D texture for a scope.
#include "oru/oru_ogl/ogl/texturebindscope.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

Texture2DBindScope::Texture2DBindScope(Texture2D *texture, unsigned int unit, bool active)
    : active_(active) {
    if (!active_)
        return;
    ORU_ASSERT_TEXT("theTexture", texture);
    previousUnit_ = TextureState::ActiveTextureUnit();
    TextureState::SetActiveTextureUnit(unit);
    unit_ = unit;
    try {
        TextureUnit const &theUnit = *TextureUnit::Unit(unit);
        bool const isFixedFunction = !internal::IsCoreContext();
        if (isFixedFunction)
            theUnit.enable2D();
        theUnit.bind(texture);
        texture->setFilter(Texture::FILTER_NEAREST, Texture::FILTER_NEAREST);
        texture->setWrap(Texture::WRAPMODE_CLAMP_TO_EDGE, Texture::WRAPMODE_CLAMP_TO_EDGE);
        if (isFixedFunction)
            theUnit.setEnv(TextureUnit::ENVIRONMENT_REPLACE);
    } catch (...) {
        end();
        throw;
    }
}

Texture2DBindScope::~Texture2DBindScope() {
    if (active_)
        end();
}

void Texture2DBindScope::end() const noexcept {
    // Each step by itself: one that fails must not keep the others from being taken.
    using internal::Release;
    Release([this] { TextureState::SetActiveTextureUnit(unit_); });
    Release([this] { TextureUnit::Unit(unit_)->bind2DDefault(); });
    Release([this] {
        if (!internal::IsCoreContext())
            TextureUnit::Unit(unit_)->disable2D();
    });
    Release([this] { TextureState::SetActiveTextureUnit(previousUnit_); });
}

} // namespace ORU::OGL
