// The exception of a failed check.
#pragma once

#include "oru/core/exceptions/logicalexception.h"

namespace ORU {

/// A violated precondition or broken invariant, thrown by the macros of checks.h.
class ORU_API InternalException : public LogicalException {
public:
    /// Makes an exception with file and message "Undefined" and line 0.
    InternalException();

    /// Makes an exception with what-text "ORU Internal exception"; parameters as for
    /// `LogicalException`.
    InternalException(char const *file, int line, char const *message);

    InternalException(InternalException const &) = default;
    InternalException &operator=(InternalException const &) = default;
    ~InternalException() override;

    ExceptionBase *clone() const override;
};

} // namespace ORU
