// A vertex array bound for a scope.
#include "oru/oru_ogl/ogl/vertexarraybindscope.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

namespace ORU::OGL {

namespace {

/// The innermost scope: what the others hold is not bound meanwhile.
thread_local VertexArrayBindScope const *gInnermost = nullptr;

} // namespace

VertexArrayBindScope::VertexArrayBindScope(VertexArray const &array)
    : array_(array), previous_(array.getBoundID()), outer_(gInnermost) {
    array_.bind();
    if (outer_)
        outer_->array_.isHeld_ = false;
    array_.isHeld_ = true;
    gInnermost = this;
}

VertexArrayBindScope::~VertexArrayBindScope() {
    array_.isHeld_ = false;
    if (outer_)
        outer_->array_.isHeld_ = true;
    gInnermost = outer_;
    internal::Release([this] { ORU_GL(BindVertexArray, previous_); });
}

} // namespace ORU::OGL
