// What the tests' runtime knows of its caller, and what a test wants of the runtime.
#pragma once

#include "oru/oru_ocl/openclheaders.h"

#include <map>
#include <mutex>
#include <optional>
#include <sstream>
#include <string>

namespace oru_test {

/// Arguments of a call as a text; texts of several make that of all.
template<class... Arguments>
std::string TextOf(Arguments... arguments) {
    std::ostringstream text;
    ((text << arguments << ' '), ...);
    return text.str();
}

/// One for each runtime, which exports it by OruTestCallBook; used from any thread.
class CallBook {
public:
    /// @name For the test
    /// @{
    /// The `call`-th call of an entry point from now (1 is the next) does nothing and reports
    /// `code`.
    void fail(std::string const &entryPoint, unsigned int call, cl_int code) {
        std::lock_guard const lock(mutex_);
        Entry &entry = entries_[entryPoint];
        entry.failing = entry.calls + call;
        entry.code = code;
    }

    /// What every platform, device and memory object answers from now.
    void answerText(cl_uint query, std::string const &text) {
        std::lock_guard const lock(mutex_);
        answers_[query] = text + '\0';
    }
    template<class T>
    void answerNumber(cl_uint query, T number) {
        std::lock_guard const lock(mutex_);
        answers_[query] = std::string(reinterpret_cast<char const *>(&number), sizeof number);
    }

    /// Forgets all of this, and the calls.
    void reset() {
        std::lock_guard const lock(mutex_);
        entries_.clear();
        answers_.clear();
    }

    /// How often an entry point was called since the last reset.
    unsigned int calls(std::string const &entryPoint) {
        std::lock_guard const lock(mutex_);
        return entries_[entryPoint].calls;
    }

    /// What it was called with the last time: numbers, texts, addresses, handles and the elements
    /// of lists, a missing one as "null". Formats and what the runtime is to fill are left out.
    std::string arguments(std::string const &entryPoint) {
        std::lock_guard const lock(mutex_);
        return entries_[entryPoint].arguments;
    }

    /// How many handles the caller holds references to.
    unsigned int liveHandles() {
        std::lock_guard const lock(mutex_);
        return static_cast<unsigned int>(references_.size());
    }

    /// The caller's references to a handle.
    int references(void const *handle) {
        std::lock_guard const lock(mutex_);
        auto const found = references_.find(handle);
        return found == references_.end() ? 0 : found->second;
    }
    /// @}

    /// @name For the runtime
    /// @{
    /// Notes a call; the code with which it is to fail, or CL_SUCCESS.
    cl_int enter(std::string const &entryPoint, std::string const &arguments) {
        std::lock_guard const lock(mutex_);
        Entry &entry = entries_[entryPoint];
        entry.arguments = arguments;
        return ++entry.calls == entry.failing ? entry.code : CL_SUCCESS;
    }

    std::optional<std::string> answerTo(cl_uint query) {
        std::lock_guard const lock(mutex_);
        auto const found = answers_.find(query);
        return found == answers_.end() ? std::nullopt : std::optional(found->second);
    }

    /// Notes a reference more or less. A release too many stays as a negative count, for the test
    /// to see.
    void count(void const *handle, int change) {
        std::lock_guard const lock(mutex_);
        if (handle && (references_[handle] += change) == 0)
            references_.erase(handle);
    }
    /// @}

private:
    struct Entry {
        unsigned int calls = 0;
        std::string arguments;
        unsigned int failing = 0; ///< the call that fails; 0 for none
        cl_int code = CL_SUCCESS;
    };

    std::mutex mutex_;
    std::map<std::string, Entry> entries_;
    std::map<cl_uint, std::string> answers_; ///< their bytes
    std::map<void const *, int> references_;
};

} // namespace oru_test
