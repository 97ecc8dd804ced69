// Failures of the C image libraries, which leave by longjmp, turned into results.
#pragma once

#include "apps/common/failure.h"

#include <csetjmp>
#include <exception>
#include <string>

namespace App {

/// Where a C library's error callback jumps to, and what it said.
struct JumpGuard {
    std::jmp_buf target;
    std::string message;
    std::exception_ptr thrown; ///< by a callback, which must not throw through the library

    /// For the error callback: keeps what the library says and leaves `guarded`.
    [[noreturn]] void leave(char const *what) {
        message = what;
        std::longjmp(target, 1);
    }

    /// For the other callbacks: runs a step that may throw.
    /// @return whether it did not; otherwise the callback has the library fail
    template<class Step>
    bool keep(Step const &step) {
        try {
            step();
        } catch (...) {
            thrown = std::current_exception();
            return false;
        }
        return true;
    }

    /// After a failure: @throws what a callback threw, else Failure of the text and the message
    [[noreturn]] void raise(char const *before) const {
        if (thrown)
            std::rethrow_exception(thrown);
        throw Failure(before + message);
    }
};

/// Runs a step that may leave by `guard.leave`. The step must not have objects with destructors of
/// its own alive while it calls the library.
/// @return whether it ran to its end
template<class Step>
bool Guarded(JumpGuard &guard, Step const &step) {
    if (setjmp(guard.target) != 0)
        return false;
    step();
    return true;
}

} // namespace App
