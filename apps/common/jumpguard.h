// Failures of the C image libraries, which leave by longjmp, turned into results.
#pragma once

#include <csetjmp>
#include <string>
#include <utility>

namespace App {

/// Where a C library's error callback jumps to, and what it said.
struct JumpGuard {
    std::jmp_buf target;
    std::string message;

    /// For the error callback: keeps what the library says and leaves `guarded`.
    [[noreturn]] void leave(char const *what) {
        message = what;
        std::longjmp(target, 1);
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
