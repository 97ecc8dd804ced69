// What the current context is: its version, and whether it is without what OpenGL 3 deprecated.
#pragma once

#include "oru/core/utility/windowsforward.h"

namespace ORU::OGL::internal {

struct ContextTraits {
    unsigned int major = 0;
    unsigned int minor = 0;
    int flags = 0;       ///< as GL_CONTEXT_FLAGS, 0 before OpenGL 3.0
    bool isCore = false; ///< a core-profile or a forward-compatible context
};

/// Asks the calling thread's current context, with plain calls that leave no GL error behind.
ContextTraits ReadContextTraits();

/// Whether the calling thread's current context is a core-profile or a forward-compatible one, in
/// which what OpenGL 3 deprecated is missing; false without one. No call goes through the chains. A
/// registered context is asked once; one that the host has not handed over each time, as its handle
/// may be another context's the next time.
bool IsCoreContext();

/// The same for a context that need not be current, and is so for a moment where it must be asked;
/// false when it cannot be made current.
bool IsCoreContext(HDC dc, HGLRC context);

} // namespace ORU::OGL::internal
