// The question for the current context, which stands before every OpenGL call beyond 1.1.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/platformgl.h"

#include <atomic>

namespace ORU::OGL::internal {

/// Whether the WGL chain is its last link alone, which only calls the platform.
extern std::atomic<bool> gIsWGLChainPlain;

/// `wcgmGetCurrentContext` of the chain's first link.
HGLRC AskChainForCurrentContext(char const *file, unsigned int line);

/// The calling thread's current context, or null, asked through the WGL chain. Where nobody listens
/// the platform is asked at once, which takes half the time.
inline HGLRC CurrentContext(char const *file, unsigned int line) {
    return ORU_LIKELY(gIsWGLChainPlain.load(std::memory_order_relaxed))
               ? ::wglGetCurrentContext()
               : AskChainForCurrentContext(file, line);
}

} // namespace ORU::OGL::internal

/// The calling thread's current context, asked with this source position.
#define ORU_CURRENT_CONTEXT() ::ORU::OGL::internal::CurrentContext(__FILE__, __LINE__)
