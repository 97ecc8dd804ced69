// The base of every failure the library reports: where it happened and why.
#pragma once

#include "oru/core/exceptions/exceptionbase.h"

namespace ORU {

/// A failure with its source position and message.
///
/// Never thrown itself: it is what a caller catches to receive failed checks, OpenGL errors and
/// OpenCL errors alike.
class ORU_API LogicalException : public ExceptionBase {
public:
    /// Makes an exception with file and message "Undefined" and line 0.
    LogicalException();

    /// Makes an exception with what-text "ORU logical exception".
    /// @param file, message copied; "Undefined" stands in for a null pointer
    /// @param line one-based source line
    LogicalException(char const *file, int line, char const *message);

    LogicalException(LogicalException const &) = default;
    LogicalException(LogicalException &&) noexcept = default;
    LogicalException &operator=(LogicalException const &) = default;
    LogicalException &operator=(LogicalException &&) noexcept = default;
    ~LogicalException() override;

    /// Source file of the failure, valid as long as the object lives.
    char const *file() const { return file_.c_str(); }

    /// Source line of the failure.
    int line() const { return line_; }

    /// What failed, valid as long as the object lives.
    char const *message() const { return message_.c_str(); }

    /// What a reader would like to know besides: which OpenGL function failed, what would help,
    /// which call of the host's led there. Notes are separated by commas; empty when there is none.
    char const *note() const;

    /// Adds a note, nothing for an empty one, as a host does for the place of its own call (see
    /// calledfrom.h).
    /// @throws std::bad_alloc when memory is exhausted
    void addNote(std::string const &note);

    ExceptionBase *clone() const override;

    /// Writes "what file:line (message)", and behind it a blank and the notes, if there are any.
    void write(std::ostream &os) const override;

private:
    void initialize(char const *file, int line, char const *message);

    std::string file_;
    int line_ = 0;
    // The message, then, if there are notes, a zero and the notes: hosts know an exception's size.
    std::string message_;
};

} // namespace ORU
