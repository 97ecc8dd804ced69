// A texture bound to a unit for a scope.
#pragma once

#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"

namespace Develop {

/// Binds a 2-D texture to a unit, which stays active; at the end the unit has none and unit 0 is
/// active. Unlike ORU::OGL::Texture2DBindScope it sets nothing of fixed-function drawing.
class TextureScope {
public:
    explicit TextureScope(ORU::OGL::Texture2D const &texture, unsigned int unit = 0) : unit_(unit) {
        ORU::OGL::TextureState::SetActiveTextureUnit(unit_);
        ORU::OGL::TextureUnit::Unit(unit_)->bind(&texture);
    }
    ~TextureScope() {
        // An error of an earlier call is reported by the exception that ended the scope.
        ORU::DropExceptions([this] {
            ORU::OGL::TextureState::SetActiveTextureUnit(unit_);
            ORU::OGL::TextureUnit::Unit(unit_)->bind2DDefault();
            ORU::OGL::TextureState::SetActiveTextureUnit(0);
        });
    }
    TextureScope(TextureScope const &) = delete;
    TextureScope &operator=(TextureScope const &) = delete;

private:
    unsigned int unit_;
};

} // namespace Develop
