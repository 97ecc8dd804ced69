// A sampler on a texture unit for a scope.
#include "oru/oru_ogl/ogl/samplerbindscope.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

SamplerBindScope::SamplerBindScope(Sampler const &sampler, unsigned int unit) : unit_(unit) {
    // Only the active unit can be asked for its sampler.
    unsigned int const active = TextureState::ActiveTextureUnit();
    if (active == unit) {
        previous_ = sampler.getBoundID();
    } else {
        TextureState::SetActiveTextureUnit(unit);
        internal::Ending restore([active] { TextureState::SetActiveTextureUnit(active); });
        previous_ = sampler.getBoundID();
        restore.now();
    }
    sampler.bind(unit);
}

SamplerBindScope::~SamplerBindScope() {
    internal::Release([this] { ORU_GL(BindSampler, unit_, previous_); });
}

} // namespace ORU::OGL
