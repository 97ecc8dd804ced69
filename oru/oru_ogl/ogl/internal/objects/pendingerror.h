// Errors that were there before a call.
#pragma once

#include "oru/oru_ogl/extensionator/internal/openglerrorcheck.h"

namespace ORU::OGL::internal {

/// Throws for an error that is pending, before a call that begins or pushes something: the call
/// would be made and throw for that error, and nobody would end what it began.
/// @param function the call's name, which would be told otherwise
inline void ReportPendingError(char const *file, unsigned int line, char const *function) {
    if (GLenum const error = ::glGetError())
        ThrowOpenGLError(file, line, error, function);
}

} // namespace ORU::OGL::internal
