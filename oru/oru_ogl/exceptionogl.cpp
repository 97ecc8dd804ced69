// The exception of a failed OpenGL call.
#include "oru/oru_ogl/exceptionogl.h"

#include "oru/core/memory/orumemory.h"

namespace ORU::OGL {

ExceptionOGL::ExceptionOGL(char const *file, unsigned int line, char const *message,
                           unsigned int errorNumber)
    : LogicalException(file, static_cast<int>(line), message), errorNumber_(errorNumber) {}

ExceptionOGL::ExceptionOGL(ExceptionOGL const &other) = default;
ExceptionOGL::ExceptionOGL(ExceptionOGL &&other) noexcept = default;
ExceptionOGL::~ExceptionOGL() = default;
ExceptionOGL &ExceptionOGL::operator=(ExceptionOGL const &other) = default;
ExceptionOGL &ExceptionOGL::operator=(ExceptionOGL &&other) noexcept = default;

ExceptionBase *ExceptionOGL::clone() const {
    return ORU_NEW ExceptionOGL(*this);
}

} // namespace ORU::OGL
