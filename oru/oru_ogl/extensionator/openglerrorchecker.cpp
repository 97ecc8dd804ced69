// The last link of the OpenGL chain: makes the real calls and checks them.
#include "oru/oru_ogl/extensionator/openglerrorchecker.h"

#include "oru/core/utility/composetext.h"
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

namespace {

char const kWithoutContext[] =
    "without a current OpenGL context: make one current in this thread (Context::makeCurrent)";

} // namespace

void ThrowOpenGLError(char const *file, unsigned int line, unsigned int error,
                      char const *function) {
    auto const *name = OpenGLErrorChecker::GetOpenGLErrorString(error);
    std::string note = ComposeText("in ", function);
    if (!::wglGetCurrentContext())
        note += ComposeText(", ", kWithoutContext);
    throw ORU_private::Noted(ExceptionOGL(file, line, reinterpret_cast<char const *>(name), error),
                             note);
}

void ThrowMissingFunction(char const *file, unsigned int line, char const *function,
                          char const *group) {
    auto const *version = reinterpret_cast<char const *>(::glGetString(GL_VERSION));
    std::string const message =
        ::wglGetCurrentContext()
            ? ComposeText(function, " is not in this driver (OpenGL ",
                          version ? version : "unknown", "), which would need ", group,
                          ": ask ExtensionManager::isSupported, or update the driver")
            : ComposeText(function, " was called ", kWithoutContext);
    throw ExceptionOGL(file, line, message.c_str(), 0);
}

void OpenGLErrorChecker::cgmBegin(char const *file, unsigned int line, GLenum mode) {
    if (insideBeginEnd_.load(std::memory_order_relaxed))
        throw ExceptionOGL(file, line, "Unbalanced glBegin()!", 0);
    insideBeginEnd_.store(true, std::memory_order_relaxed);
    internal::gIsOpenGLChainPlain.store(false, std::memory_order_relaxed);
    ::glBegin(mode);
}

void OpenGLErrorChecker::cgmEnd(char const *file, unsigned int line) {
    if (!insideBeginEnd_.load(std::memory_order_relaxed))
        throw ExceptionOGL(file, line, "Unbalanced glEnd()!", 0);
    insideBeginEnd_.store(false, std::memory_order_relaxed);
    internal::gIsOpenGLChainPlain.store(Instance() == this, std::memory_order_relaxed);
    ::glEnd();
    CheckOpenGLError(insideBeginEnd_, file, line, "glEnd");
}

GLenum OpenGLErrorChecker::cgmGetError(char const *file, unsigned int line) {
    // The check asks again: it reports a second pending error, the first is the caller's result.
    GLenum const error = ::glGetError();
    CheckOpenGLError(insideBeginEnd_, file, line, "glGetError");
    return error;
}

} // namespace ORU::OGL
