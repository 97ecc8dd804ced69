// Vertices captured for a scope.
#include "oru/oru_ogl/ogl/transformfeedbackscope.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/pendingerror.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/transformfeedback.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

void BindObject(unsigned int name) {
    ORU_GL(BindTransformFeedback, GL_TRANSFORM_FEEDBACK, name);
}

void End() {
    ORU_GL0(EndTransformFeedback);
}

} // namespace

TransformFeedbackScope::TransformFeedbackScope(unsigned int primitive) {
    ORU_ASSERT_TEXT("Transform feedback needs a current context of OpenGL 3.0",
                    internal::Supports(GL_VERSION_3_0));
    internal::ReportPendingError(__FILE__, __LINE__, "glBeginTransformFeedback");
    ORU_GL(BeginTransformFeedback, primitive);
}

TransformFeedbackScope::TransformFeedbackScope(TransformFeedback &feedback, unsigned int primitive)
    : hasObject_(true), previous_(feedback.getBoundID()) {
    try {
        feedback.bind();
        ORU_GL(BeginTransformFeedback, primitive);
    } catch (...) {
        internal::Release([this] { BindObject(previous_); });
        throw;
    }
}

TransformFeedbackScope::~TransformFeedbackScope() {
    internal::Release(End);
    if (hasObject_)
        internal::Release([this] { BindObject(previous_); });
}

void TransformFeedbackScope::pause() {
    ORU_GL0(PauseTransformFeedback);
}

void TransformFeedbackScope::resume() {
    ORU_GL0(ResumeTransformFeedback);
}

} // namespace ORU::OGL
