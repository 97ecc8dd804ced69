// One of OpenGL's switches turned for a scope.
#include "oru/oru_ogl/ogl/switchscope.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

void Turn(GLenum capability, bool on) {
    if (on)
        ORU_GL(Enable, capability);
    else
        ORU_GL(Disable, capability);
}

} // namespace

TemporarySwitchScope::TemporarySwitchScope(unsigned int capability, bool on)
    : capability_(capability), found_(ORU_GL(IsEnabled, capability) != GL_FALSE), set_(on) {
    if (found_ == set_)
        return;
    try {
        Turn(capability_, set_);
    } catch (...) {
        putBack(); // the switch may have turned all the same
        throw;
    }
}

TemporarySwitchScope::~TemporarySwitchScope() {
    putBack();
}

void TemporarySwitchScope::putBack() noexcept {
    if (found_ != set_)
        internal::Release([this] { Turn(capability_, found_); });
}

} // namespace ORU::OGL
