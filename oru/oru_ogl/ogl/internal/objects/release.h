// Deleting GL objects in destructors.
#pragma once

#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/internal/currentcontext.h"

namespace ORU::OGL::internal {

/// Runs the steps of a destructor that delete GL objects, each whatever became of the one before,
/// and drops what they throw. Without a current context, in which no entry point beyond OpenGL 1.1
/// has an address, it does nothing: the objects went with their context.
template<class... Step>
void Release(Step... step) noexcept {
    bool hasContext = false;
    DropExceptions([&] { hasContext = ORU_CURRENT_CONTEXT() != nullptr; });
    if (hasContext)
        (DropExceptions(step), ...);
}

} // namespace ORU::OGL::internal
