// Line smoothing, stippling and width changed for a scope.
#include "oru/oru_ogl/ogl/linescope.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

using internal::Release;

namespace {

bool IsOn(GLenum name) {
    GLboolean value = GL_FALSE;
    ORU_GL(GetBooleanv, name, &value);
    return value != GL_FALSE;
}

void Switch(bool on) {
    if (on)
        ORU_GL(Enable, GL_LINE_STIPPLE);
    else
        ORU_GL(Disable, GL_LINE_STIPPLE);
}

} // namespace

void LineSmoothState::getLineSmoothState() {
    enabled = IsOn(GL_LINE_SMOOTH);
}

TemporaryLineSmoothScope::TemporaryLineSmoothScope() {
    saved_.getLineSmoothState();
    if (!saved_.enabled)
        ORU_GL(Enable, GL_LINE_SMOOTH);
    current_.getLineSmoothState();
}

TemporaryLineSmoothScope::~TemporaryLineSmoothScope() {
    if (current_.enabled && !saved_.enabled)
        Release([] { ORU_GL(Disable, GL_LINE_SMOOTH); });
}

void LineStippleState::setToCurrentGLValues() {
    ORU_ASSERT_TEXT(
        "Line stippling needs a compatibility context: in a core one leave fragments out "
        "in a shader",
        !internal::IsCoreContext());
    enabled = IsOn(GL_LINE_STIPPLE);
    if (!enabled)
        return;
    ORU_GL(GetIntegerv, GL_LINE_STIPPLE_REPEAT, &factor);
    GLint bits = 0;
    ORU_GL(GetIntegerv, GL_LINE_STIPPLE_PATTERN, &bits);
    pattern = static_cast<unsigned short>(bits);
}

TemporaryLineStippleScope::TemporaryLineStippleScope(unsigned char enable, int factor,
                                                     unsigned short pattern) {
    saved_.setToCurrentGLValues();
    LineStippleState const wanted{enable != 0, factor, pattern};
    bool const bothOff = !saved_.enabled && !wanted.enabled;
    if (bothOff || saved_ == wanted)
        current_ = wanted;
    else
        updateCurrentState(enable, factor, pattern);
}

TemporaryLineStippleScope::~TemporaryLineStippleScope() {
    if (current_ == saved_)
        return;
    Release([this] { Switch(saved_.enabled); });
    if (saved_.enabled)
        Release([this] { ORU_GL(LineStipple, saved_.factor, saved_.pattern); });
}

void TemporaryLineStippleScope::updateCurrentState(unsigned char enable, int factor,
                                                   unsigned short pattern) {
    Switch(enable != 0);
    if (enable)
        ORU_GL(LineStipple, factor, pattern);
    current_ = {enable != 0, factor, pattern};
}

void LineWidthState::setToCurrentGLValues() {
    ORU_GL(GetFloatv, GL_LINE_WIDTH, &width);
}

TemporaryLineWidthScope::TemporaryLineWidthScope(float width) {
    saved_.setToCurrentGLValues();
    current_.width = width;
    if (saved_.width != width)
        ORU_GL(LineWidth, width);
}

TemporaryLineWidthScope::~TemporaryLineWidthScope() {
    if (current_.width != saved_.width)
        Release([this] { ORU_GL(LineWidth, saved_.width); });
}

} // namespace ORU::OGL
