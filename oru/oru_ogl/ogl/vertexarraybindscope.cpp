// A vertex array bound for a scope.
#include "oru/oru_ogl/ogl/vertexarraybindscope.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

namespace ORU::OGL {

VertexArrayBindScope::VertexArrayBindScope(VertexArray const &array)
    : array_(array), previous_(array.getBoundID()), wasHeld_(array.isHeld_) {
    array_.bind();
    array_.isHeld_ = true;
}

VertexArrayBindScope::~VertexArrayBindScope() {
    array_.isHeld_ = wasHeld_;
    internal::Release([this] { ORU_GL(BindVertexArray, previous_); });
}

} // namespace ORU::OGL
