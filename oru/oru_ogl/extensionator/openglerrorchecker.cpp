// The last link of the OpenGL chain: makes the real calls and checks them.
#include "oru/oru_ogl/extensionator/openglerrorchecker.h"

#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/extensionator/internal/openglerrorcheck.h"

namespace ORU::OGL {

OpenGLErrorChecker::~OpenGLErrorChecker() = default;

unsigned char const *OpenGLErrorChecker::GetOpenGLErrorString(unsigned int error) {
    char const *text = "Unspecified GL error";
    switch (error) {
    case GL_INVALID_ENUM:
        text = "GL_INVALID_ENUM";
        break;
    case GL_INVALID_VALUE:
        text = "GL_INVALID_VALUE";
        break;
    case GL_INVALID_OPERATION:
        text = "GL_INVALID_OPERATION";
        break;
    case GL_STACK_OVERFLOW:
        text = "GL_STACK_OVERFLOW";
        break;
    case GL_STACK_UNDERFLOW:
        text = "GL_STACK_UNDERFLOW";
        break;
    case GL_OUT_OF_MEMORY:
        text = "GL_OUT_OF_MEMORY";
        break;
    case GL_INVALID_FRAMEBUFFER_OPERATION:
        text = "GL_INVALID_FRAMEBUFFER_OPERATION";
        break;
    case GL_CONTEXT_LOST:
        text = "GL_CONTEXT_LOST";
        break;
    case GL_TABLE_TOO_LARGE:
        text = "GL_TABLE_TOO_LARGE";
        break;
    default:
        break;
    }
    return reinterpret_cast<unsigned char const *>(text);
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
