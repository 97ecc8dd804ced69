// What the caller did with the runtime.
#include "callbook.h"

namespace oru_test::runtime {

CallBook &CallBook::Instance() {
    static CallBook book;
    return book;
}

cl_int CallBook::enter(char const *entryPoint) {
    std::lock_guard const lock(mutex_);
    ++calls_[entryPoint];
    auto const failure = failures_.find(entryPoint);
    if (failure == failures_.end() || --failure->second.call > 0)
        return CL_SUCCESS;
    cl_int const code = failure->second.code;
    failures_.erase(failure);
    return code;
}

void CallBook::fail(char const *entryPoint, unsigned int call, cl_int code) {
    std::lock_guard const lock(mutex_);
    failures_[entryPoint] = {call, code};
}

void CallBook::reset() {
    std::lock_guard const lock(mutex_);
    calls_.clear();
    failures_.clear();
}

unsigned int CallBook::calls(char const *entryPoint) {
    std::lock_guard const lock(mutex_);
    auto const found = calls_.find(entryPoint);
    return found == calls_.end() ? 0 : found->second;
}

void CallBook::add(void const *handle) {
    std::lock_guard const lock(mutex_);
    ++references_[handle];
}

bool CallBook::remove(void const *handle) {
    std::lock_guard const lock(mutex_);
    auto const found = references_.find(handle);
    // A release too many stays as a negative count, for the test to see.
    if (found == references_.end()) {
        references_[handle] = -1;
        return false;
    }
    if (--found->second != 0)
        return false;
    references_.erase(found);
    return true;
}

unsigned int CallBook::liveHandles() {
    std::lock_guard const lock(mutex_);
    return static_cast<unsigned int>(references_.size());
}

int CallBook::references(void const *handle) {
    std::lock_guard const lock(mutex_);
    auto const found = references_.find(handle);
    return found == references_.end() ? 0 : found->second;
}

} // namespace oru_test::runtime
