// The last link of the OpenGL chain: makes the real calls and checks them.
#pragma once

#include "oru/oru_ogl/extensionator/openglinterceptor.h"

#include <atomic>

namespace ORU::OGL {

/// Makes each OpenGL call and throws ExceptionOGL when `glGetError` reports an error after it.
///
/// OpenGL 1.1 functions are called directly, all others through the function table of the calling
/// thread's current context. Between `cgmBegin` and `cgmEnd` OpenGL allows no error query, so none
/// is made; the state is one for the process, which leaves immediate-mode drawing to one thread at
/// a time.
class ORU_API OpenGLErrorChecker : public OpenGLInterceptor {
public:
    /// The chain makes its own.
    OpenGLErrorChecker() = default;
    ~OpenGLErrorChecker() override;

    /// The name of a GL error value, "Unspecified GL error" for any other value. The text is
    /// static.
    static unsigned char const *GetOpenGLErrorString(unsigned int error);

    /// Whether `cgmBegin` was called and `cgmEnd` not yet.
    bool isInsideBeginEnd() const { return insideBeginEnd_.load(std::memory_order_relaxed); }

#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments) Result cgm##Name Parameters override;
#include "oru/oru_ogl/extensionator/gloperations.inc"

private:
    /// True between `cgmBegin` and `cgmEnd`; relaxed accesses, which cost what a plain bool costs.
    std::atomic<bool> insideBeginEnd_{false};
};

} // namespace ORU::OGL
