// Errors that were there before a call.
#pragma once

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL::internal {

/// Reports an error that is pending. For the constructors of scopes: the call that begins something
/// would report it when it has begun, and no destructor would end that.
/// @note glGetIntegerv
inline void ReportPendingError() {
    GLint unused = 0;
    ORU_GL(GetIntegerv, GL_CURRENT_PROGRAM, &unused);
}

} // namespace ORU::OGL::internal
