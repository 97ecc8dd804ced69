// What the constructor of a scope begins and its destructor ends.
#pragma once

#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"

namespace ORU::OGL::internal {

/// Runs `begin`, and after a GL error `end`: one that was pending before ends the call, too, which
/// has begun then, and no destructor would follow.
template<class Begin, class End>
void BeginScope(Begin begin, End end) {
    try {
        begin();
    } catch (ExceptionOGL const &) {
        Release(end);
        throw;
    }
}

} // namespace ORU::OGL::internal
