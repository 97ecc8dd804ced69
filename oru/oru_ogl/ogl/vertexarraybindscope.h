// A vertex array bound for a scope.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

class VertexArray;

/// Binds a vertex array until the scope ends; then the one is bound again that was bound before.
/// Meanwhile its draws are nothing but the draw: none asks what is bound.
///
/// ```cpp
/// VertexArrayBindScope const bound(array);
/// for (Part const &part : parts) {
///     … a texture, uniforms …
///     array.drawElements(GL_TRIANGLES, part.count, part.first);
/// }
/// ```
///
/// While it lives, let nobody bind another vertex array but by another scope, and draw no
/// VertexBuffer, which leaves none bound. The vertex array outlives the scope and stays where it
/// is.
class ORU_API VertexArrayBindScope {
public:
    /// @note glGetIntegerv, glBindVertexArray
    explicit VertexArrayBindScope(VertexArray const &array);

    /// Binds again what was bound before; a failure is dropped.
    ~VertexArrayBindScope();

    VertexArrayBindScope(VertexArrayBindScope const &) = delete;
    VertexArrayBindScope &operator=(VertexArrayBindScope const &) = delete;

private:
    VertexArray const &array_;
    unsigned int previous_;             ///< the name that was bound
    VertexArrayBindScope const *outer_; ///< the scope around this one
};

} // namespace ORU::OGL
