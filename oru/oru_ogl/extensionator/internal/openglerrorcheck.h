// The error query after each OpenGL call, inlined into the generated operations.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/openglerrorchecker.h"
#include "oru/oru_ogl/platformgl.h"

#include <atomic>

namespace ORU::OGL {

/// Throws the ExceptionOGL of a GL error value.
[[noreturn]] ORU_COLD void ThrowOpenGLError(char const *file, unsigned int line,
                                            unsigned int error);

/// Throws when the call before left an error; asks nothing inside glBegin and glEnd, where OpenGL
/// allows no query.
inline void CheckOpenGLError(std::atomic<bool> const &insideBeginEnd, char const *file,
                             unsigned int line) {
    if (insideBeginEnd.load(std::memory_order_relaxed))
        return;
    if (GLenum const error = ::glGetError())
        ThrowOpenGLError(file, line, error);
}

} // namespace ORU::OGL
