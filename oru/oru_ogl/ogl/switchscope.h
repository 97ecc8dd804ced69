// One of OpenGL's switches turned for a scope.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

/// Turns one of OpenGL's switches on or off until the block ends: what `glEnable` takes and no
/// other scope holds.
///
/// ```cpp
/// TemporarySwitchScope const unseen(GL_RASTERIZER_DISCARD, true);      // feedback only
/// TemporarySwitchScope const seamless(GL_TEXTURE_CUBE_MAP_SEAMLESS, true);
/// TemporarySwitchScope const encoded(GL_FRAMEBUFFER_SRGB, true);       // sRGB images drawn into
/// ```
///
/// It asks how the switch is, and at its end puts that back if it changed it.
class ORU_API TemporarySwitchScope {
public:
    /// @param capability GL enumeration value of the switch
    /// @throws ExceptionOGL for one that the context does not have
    /// @note glIsEnabled; glEnable or glDisable
    TemporarySwitchScope(unsigned int capability, bool on);

    /// Puts the switch back; a failure is dropped.
    ~TemporarySwitchScope();

    TemporarySwitchScope(TemporarySwitchScope const &) = delete;
    TemporarySwitchScope &operator=(TemporarySwitchScope const &) = delete;

    /// How the switch was before.
    bool found() const { return found_; }

private:
    void putBack() noexcept;

    unsigned int capability_;
    bool found_;
    bool set_;
};

} // namespace ORU::OGL
