// The error query after each OpenGL call, inlined into the generated operations.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/openglerrorchecker.h"
#include "oru/oru_ogl/platformgl.h"

#include <atomic>

namespace ORU::OGL {

/// Throws the ExceptionOGL of a GL error value, with a note that names the function.
[[noreturn]] ORU_COLD void ThrowOpenGLError(char const *file, unsigned int line, unsigned int error,
                                            char const *function);

/// Throws for a function that the table of the calling thread lacks.
/// @param group the capability that the function comes with
[[noreturn]] ORU_COLD void ThrowMissingFunction(char const *file, unsigned int line,
                                                char const *function, char const *group);

namespace internal {

/// Whether the chain is its last link alone, outside glBegin and glEnd.
extern std::atomic<bool> gIsOpenGLChainPlain;

inline bool IsOpenGLChainPlain() {
    return gIsOpenGLChainPlain.load(std::memory_order_relaxed);
}

} // namespace internal

/// Throws when the call of `function` before left an error.
inline void CheckOpenGLError(char const *file, unsigned int line, char const *function) {
    GLenum const error = ::glGetError();
    if (!ORU_LIKELY(error == GL_NO_ERROR))
        ThrowOpenGLError(file, line, error, function);
}

/// The same, but asks nothing inside glBegin and glEnd, where OpenGL allows no query.
inline void CheckOpenGLError(std::atomic<bool> const &insideBeginEnd, char const *file,
                             unsigned int line, char const *function) {
    if (ORU_LIKELY(!insideBeginEnd.load(std::memory_order_relaxed)))
        CheckOpenGLError(file, line, function);
}

/// The same after a call that made a name, which goes before the exception does: nobody else has
/// it.
template<class Name>
void CheckOpenGLError(std::atomic<bool> const &insideBeginEnd, char const *file, unsigned int line,
                      char const *function, void(ORU_APIENTRY *deleteName)(Name), Name name) {
    if (insideBeginEnd.load(std::memory_order_relaxed))
        return;
    if (GLenum const error = ::glGetError()) {
        deleteName(name);
        ThrowOpenGLError(file, line, error, function);
    }
}

} // namespace ORU::OGL
