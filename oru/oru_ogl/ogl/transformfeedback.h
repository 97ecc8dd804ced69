// What the stages before the fragments make of vertices, captured in buffers.
#pragma once

#include "oru/oru_ogl/ogl/object.h"

#include <cstddef>

namespace ORU::OGL {

class Buffer;

/// A transform feedback object: the buffers that captured vertices go to, and how many there are.
///
/// ```cpp
/// program.setFeedbackVaryings({"place", "speed"}, Program::FEEDBACKMODE_INTERLEAVED);
/// program.link(true);
/// TransformFeedback feedback;
/// feedback.setBuffer(0, buffer);
/// program.enable();
/// {
///     TransformFeedbackScope const capture(feedback, GL_POINTS);
///     vertices.drawPrimitives();
/// }
/// feedback.draw(GL_POINTS); // as many as were captured
/// ```
///
/// Keep the buffers alive. OpenGL 4.0, or GL_ARB_transform_feedback2; what OpenGL 3.0 has is a
/// TransformFeedbackScope without an object.
class ORU_API TransformFeedback : public Object {
public:
    /// Makes an object without buffers and does not bind it.
    /// @throws InternalException without `IsSupported()`
    /// @note glGenTransformFeedbacks
    TransformFeedback();

    /// An object that was made elsewhere. After a failure the name is the caller's as before.
    /// @throws InternalException without `IsSupported()`, and for a name that is no such object
    /// @note glIsTransformFeedback
    TransformFeedback(unsigned int name, ownership_tag ownership);

    TransformFeedback(TransformFeedback &&other) noexcept = default;
    TransformFeedback &operator=(TransformFeedback &&other) noexcept;

    /// Deletes the name that the object owns. @note glDeleteTransformFeedbacks
    ~TransformFeedback() override;

    /// Binds the object. @note glBindTransformFeedback
    void bind();

    /// Binds the context's own. @note glBindTransformFeedback
    static void BindDefault();

    /// Captures into a buffer from its beginning. What is bound stays.
    /// @param index of the buffer: 0 for interleaved varyings, else the varying's
    /// @note glBindBufferRange, glBindTransformFeedback, glBindBuffer
    void setBuffer(unsigned int index, Buffer const &buffer);

    /// Captures into a part of a buffer.
    /// @param offset, size bytes, multiples of 4
    /// @throws InternalException for a part that is empty or leaves the buffer, and for numbers
    ///         that are no multiples of 4
    void setBuffer(unsigned int index, Buffer const &buffer, std::size_t offset, std::size_t size);

    /// Draws as many vertices as were captured last, of the vertex array that is bound.
    /// @param primitive GL_POINTS, GL_TRIANGLES and the like
    /// @note glDrawTransformFeedback
    void draw(unsigned int primitive) const;

    /// Whether the current context has such objects; false without a context.
    static bool IsSupported();

private:
    void deleteObject() noexcept;
};

} // namespace ORU::OGL
