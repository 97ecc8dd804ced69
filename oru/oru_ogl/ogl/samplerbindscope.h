// A sampler on a texture unit for a scope.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

class Sampler;

/// Binds a sampler to a texture unit until the scope ends; then the one is bound again that was
/// there before. The active unit stays.
class ORU_API SamplerBindScope {
public:
    /// @param unit index of a texture unit
    /// @throws ExceptionOGL for an index beyond the context's units
    /// @note glGetIntegerv, glActiveTexture, glBindSampler
    SamplerBindScope(Sampler const &sampler, unsigned int unit);

    /// Puts the unit's sampler back; a failure is dropped.
    ~SamplerBindScope();

    SamplerBindScope(SamplerBindScope const &) = delete;
    SamplerBindScope &operator=(SamplerBindScope const &) = delete;

private:
    unsigned int unit_;
    unsigned int previous_ = 0; ///< the name that was bound there
};

} // namespace ORU::OGL
