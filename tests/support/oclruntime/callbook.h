// What the caller did with the runtime: calls counted and failed on command, handles held.
#pragma once

#include "oru/oru_ocl/openclheaders.h"

#include <map>
#include <mutex>
#include <string>

namespace oru_test::runtime {

/// One for the process; used from any thread.
class CallBook {
public:
    static CallBook &Instance() {
        static CallBook book;
        return book;
    }

    /// Counts a call; the code with which it is to fail, or CL_SUCCESS.
    cl_int enter(char const *entryPoint) {
        std::lock_guard const lock(mutex_);
        ++calls_[entryPoint];
        auto const failure = failures_.find(entryPoint);
        if (failure == failures_.end() || --failure->second.call > 0)
            return CL_SUCCESS;
        return failures_.extract(failure).mapped().code;
    }

    void fail(char const *entryPoint, unsigned int call, cl_int code) {
        std::lock_guard const lock(mutex_);
        failures_[entryPoint] = {call, code};
    }

    void reset() {
        std::lock_guard const lock(mutex_);
        calls_.clear();
        failures_.clear();
    }

    unsigned int calls(char const *entryPoint) {
        std::lock_guard const lock(mutex_);
        return calls_[entryPoint];
    }

    /// Notes a reference more or less; whether it was the last. A release too many stays as a
    /// negative count, for the test to see.
    bool count(void const *handle, int change) {
        std::lock_guard const lock(mutex_);
        bool const isLast = (references_[handle] += change) == 0;
        if (isLast)
            references_.erase(handle);
        return isLast;
    }

    unsigned int liveHandles() {
        std::lock_guard const lock(mutex_);
        return static_cast<unsigned int>(references_.size());
    }

    int references(void const *handle) {
        std::lock_guard const lock(mutex_);
        auto const found = references_.find(handle);
        return found == references_.end() ? 0 : found->second;
    }

private:
    struct Failure {
        unsigned int call = 0;
        cl_int code = CL_SUCCESS;
    };

    std::mutex mutex_;
    std::map<std::string, unsigned int> calls_;
    std::map<std::string, Failure> failures_;
    std::map<void const *, int> references_;
};

} // namespace oru_test::runtime
