// Deleting GL objects in destructors.
#pragma once

#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"

namespace ORU::OGL::internal {

/// Runs the step of a destructor that deletes GL objects, and drops what it throws. Without a
/// current context, in which no entry point beyond OpenGL 1.1 has an address, it does nothing: the
/// objects went with their context.
template<class Step>
void Release(Step step) noexcept {
    DropExceptions([&] {
        if (ORU_WGL0(GetCurrentContext))
            step();
    });
}

} // namespace ORU::OGL::internal
