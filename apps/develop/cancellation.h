// The wish to end that a person tells by Ctrl-C or by closing the console.
#pragma once

#include <atomic>

namespace Develop {

/// Heeds it for the object's lifetime, of which there is one at a time. The first Ctrl-C or
/// Ctrl-Break is a wish, the second ends the process at once. When the console goes, the system
/// gives the program some seconds more.
class Cancellation {
public:
    /// What a process that was cancelled ends with, as shells expect it after Ctrl-C.
    static constexpr int kExitCode = 130;

    Cancellation();
    ~Cancellation();
    Cancellation(Cancellation const &) = delete;
    Cancellation &operator=(Cancellation const &) = delete;

    std::atomic<bool> const &isRequested() const;
};

} // namespace Develop
