// What the stages before the fragments make of vertices, captured in buffers.
#include "oru/oru_ogl/ogl/transformfeedback.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/platformgl.h"

#include <utility>

namespace ORU::OGL {

namespace {

void RequireObjects() {
    ORU_ASSERT_TEXT("Transform feedback objects need OpenGL 4.0 or GL_ARB_transform_feedback2: ask "
                    "TransformFeedback::IsSupported first, or capture without an object",
                    TransformFeedback::IsSupported());
}

} // namespace

TransformFeedback::TransformFeedback()
    : Object(GL_TRANSFORM_FEEDBACK, GL_TRANSFORM_FEEDBACK_BINDING) {
    RequireObjects();
    try {
        ORU_GL(GenTransformFeedbacks, 1, &objectID_);
        ORU_ASSERT(objectID_ != 0);
    } catch (...) {
        deleteObject(); // an error that was pending before ends the call when the name is made
        throw;
    }
}

TransformFeedback::TransformFeedback(unsigned int name, ownership_tag ownership)
    : Object(GL_TRANSFORM_FEEDBACK, GL_TRANSFORM_FEEDBACK_BINDING, name, ownership) {
    RequireObjects();
    internal::RequireName(ORU_GL(IsTransformFeedback, name), name, "transform feedback object");
}

TransformFeedback &TransformFeedback::operator=(TransformFeedback &&other) noexcept {
    if (this != &other) {
        deleteObject();
        Object::operator=(std::move(other));
    }
    return *this;
}

TransformFeedback::~TransformFeedback() {
    deleteObject();
}

void TransformFeedback::deleteObject() noexcept {
    if (ownsName())
        internal::Release([this] { ORU_GL(DeleteTransformFeedbacks, 1, &objectID_); });
}

void TransformFeedback::bind() {
    ORU_GL(BindTransformFeedback, target(), objectID_);
}

void TransformFeedback::BindDefault() {
    ORU_GL(BindTransformFeedback, GL_TRANSFORM_FEEDBACK, 0u);
}

void TransformFeedback::setBuffer(unsigned int index, Buffer const &buffer) {
    setBuffer(index, buffer, 0, static_cast<std::size_t>(buffer.size()) / 4 * 4);
}

void TransformFeedback::setBuffer(unsigned int index, Buffer const &buffer, std::size_t offset,
                                  std::size_t size) {
    if (size == 0 || offset > buffer.size() || size > buffer.size() - offset || offset % 4 != 0 ||
        size % 4 != 0)
        ORU_THROW_INTERNAL("Feedback goes to whole multiples of 4 bytes within its "
                           "buffer: not to ",
                           size, " bytes behind ", offset, " of ", buffer.size());
    internal::BoundObjectScope bound(*this, ORU_BINDER(BindTransformFeedback));
    // The call binds the buffer to the target itself, too, beside the object's place for it.
    GLint previous = 0;
    ORU_GL(GetIntegerv, GL_TRANSFORM_FEEDBACK_BUFFER_BINDING, &previous);
    internal::Ending restore([previous] {
        ORU_GL(BindBuffer, GL_TRANSFORM_FEEDBACK_BUFFER, static_cast<GLuint>(previous));
    });
    ORU_GL(BindBufferRange, GL_TRANSFORM_FEEDBACK_BUFFER, index, buffer.checkedID(),
           static_cast<GLintptr>(offset), static_cast<GLsizeiptr>(size));
    restore.now();
    bound.restore();
}

void TransformFeedback::draw(unsigned int primitive) const {
    ORU_GL(DrawTransformFeedback, primitive, checkedID());
}

bool TransformFeedback::IsSupported() {
    return internal::Supports(GL_ARB_TRANSFORM_FEEDBACK2);
}

} // namespace ORU::OGL
