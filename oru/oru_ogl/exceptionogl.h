// The exception of a failed OpenGL call.
#pragma once

#include "oru/core/exceptions/logicalexception.h"

namespace ORU::OGL {

/// An OpenGL call failed: `message()` names the GL error, `file()` and `line()` the call, `note()`
/// the OpenGL function ("in glTexImage2D").
///
/// A function that cannot be called at all, as there is no current context or the driver lacks it,
/// is reported with number 0 and a message that says which.
class ORU_API ExceptionOGL : public LogicalException {
public:
    /// Makes the exception of one call.
    /// @param file, line source position of the failed call
    /// @param message the GL error's name
    /// @param errorNumber the value that `glGetError` gave, 0 when OpenGL was not asked
    ExceptionOGL(char const *file, unsigned int line, char const *message,
                 unsigned int errorNumber);
    ExceptionOGL(ExceptionOGL const &other);
    ExceptionOGL(ExceptionOGL &&other) noexcept;
    ~ExceptionOGL() override;

    ExceptionOGL &operator=(ExceptionOGL const &other);
    ExceptionOGL &operator=(ExceptionOGL &&other) noexcept;

    ExceptionBase *clone() const override;

    /// The OpenGL error enumeration value.
    unsigned int errorNumber() const { return errorNumber_; }

private:
    unsigned int errorNumber_;
};

} // namespace ORU::OGL
