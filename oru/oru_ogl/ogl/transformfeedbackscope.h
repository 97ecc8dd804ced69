// Vertices captured for a scope.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

class TransformFeedback;

/// Captures what is drawn for a scope; see TransformFeedback.
class ORU_API TransformFeedbackScope {
public:
    /// Begins to capture by what is bound, which OpenGL 3.0 has without an object: there
    /// Buffer::bindBase binds the buffers to GL_TRANSFORM_FEEDBACK_BUFFER.
    /// @param primitive what is captured: GL_POINTS, GL_LINES or GL_TRIANGLES
    /// @throws InternalException before OpenGL 3.0; ExceptionOGL without a buffer, or when the
    ///         current program captures nothing
    /// @note glBeginTransformFeedback
    explicit TransformFeedbackScope(unsigned int primitive);

    /// Binds an object, which outlives the scope, and begins to capture.
    /// @throws as the other
    /// @note glGetIntegerv, glBindTransformFeedback, glBeginTransformFeedback
    TransformFeedbackScope(TransformFeedback &feedback, unsigned int primitive);

    TransformFeedbackScope(TransformFeedbackScope const &) = delete;
    TransformFeedbackScope &operator=(TransformFeedbackScope const &) = delete;

    /// Ends the capture, and binds the object that was bound before.
    /// @note glEndTransformFeedback, glBindTransformFeedback
    ~TransformFeedbackScope();

    /// Draws without being captured until `resume()`. OpenGL 4.0 or GL_ARB_transform_feedback2.
    /// @note glPauseTransformFeedback
    void pause();

    /// Goes on to capture. @note glResumeTransformFeedback
    void resume();

private:
    bool hasObject_ = false;
    unsigned int previous_ = 0; ///< name of the object to bind at the end
};

} // namespace ORU::OGL
