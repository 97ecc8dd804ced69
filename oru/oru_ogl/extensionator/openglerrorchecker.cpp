// The last link of the OpenGL chain: makes the real calls and checks them.
#include "oru/oru_ogl/extensionator/openglerrorchecker.h"

#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/extensionator/internal/openglerrorcheck.h"

namespace ORU::OGL {

OpenGLErrorChecker::~OpenGLErrorChecker() = default;

unsigned char const *OpenGLErrorChecker::GetOpenGLErrorString(unsigned int error) {
#define ORU_ERROR_NAME(Error)                                                                      \
    case Error:                                                                                    \
        return reinterpret_cast<unsigned char const *>(#Error)

    switch (error) {
        ORU_ERROR_NAME(GL_INVALID_ENUM);
        ORU_ERROR_NAME(GL_INVALID_VALUE);
        ORU_ERROR_NAME(GL_INVALID_OPERATION);
        ORU_ERROR_NAME(GL_STACK_OVERFLOW);
        ORU_ERROR_NAME(GL_STACK_UNDERFLOW);
        ORU_ERROR_NAME(GL_OUT_OF_MEMORY);
        ORU_ERROR_NAME(GL_INVALID_FRAMEBUFFER_OPERATION);
        ORU_ERROR_NAME(GL_CONTEXT_LOST);
        ORU_ERROR_NAME(GL_TABLE_TOO_LARGE);
    default:
        return reinterpret_cast<unsigned char const *>("Unspecified GL error");
    }
#undef ORU_ERROR_NAME
}

void ThrowOpenGLError(char const *file, unsigned int line, unsigned int error) {
    auto const *name = OpenGLErrorChecker::GetOpenGLErrorString(error);
    throw ExceptionOGL(file, line, reinterpret_cast<char const *>(name), error);
}

void OpenGLErrorChecker::cgmBegin(char const *file, unsigned int line, GLenum mode) {
    if (insideBeginEnd_.load(std::memory_order_relaxed))
        throw ExceptionOGL(file, line, "Unbalanced glBegin()!", 0);
    insideBeginEnd_.store(true, std::memory_order_relaxed);
    ::glBegin(mode);
}

void OpenGLErrorChecker::cgmEnd(char const *file, unsigned int line) {
    if (!insideBeginEnd_.load(std::memory_order_relaxed))
        throw ExceptionOGL(file, line, "Unbalanced glEnd()!", 0);
    insideBeginEnd_.store(false, std::memory_order_relaxed);
    ::glEnd();
    CheckOpenGLError(insideBeginEnd_, file, line);
}

GLenum OpenGLErrorChecker::cgmGetError(char const *file, unsigned int line) {
    // The check asks again: it reports a second pending error, the first is the caller's result.
    GLenum const error = ::glGetError();
    CheckOpenGLError(insideBeginEnd_, file, line);
    return error;
}

} // namespace ORU::OGL
