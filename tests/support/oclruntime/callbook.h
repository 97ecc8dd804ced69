// What the tests' runtime knows of its caller, and what a test wants of the runtime.
#pragma once

#include "oru/oru_ocl/openclheaders.h"
#include "tests/support/textof.h"

#include <map>
#include <string>

namespace oru_test {

/// One for each runtime, which exports it by OruTestCallBook; used while no call is under way. The
/// runtime itself uses what follows `references`.
class CallBook {
public:
    CallBook() { reset(); }

    /// The `call`-th call of an entry point from now (1 is the next) does nothing and reports
    /// `code`.
    void fail(std::string const &entryPoint, unsigned int call, cl_int code) {
        Entry &entry = entries_[entryPoint];
        entry.failing = entry.calls + call;
        entry.code = code;
    }

    /// What every platform, device and memory object answers from now.
    void answerText(cl_uint query, std::string const &text) { answers_[query] = text + '\0'; }
    template<class T>
    void answerNumber(cl_uint query, T number) {
        answers_[query] = std::string(reinterpret_cast<char const *>(&number), sizeof number);
    }

    /// Forgets all of this, and the calls.
    void reset() {
        entries_.clear();
        answers_.clear();
        answerText(CL_PLATFORM_EXTENSIONS, "cl_khr_gl_sharing");
        answerText(CL_DEVICE_EXTENSIONS, "cl_khr_gl_sharing");
    }

    /// How often an entry point was called since the last reset.
    unsigned int calls(std::string const &entryPoint) { return entries_[entryPoint].calls; }

    /// What it was called with the last time: numbers, texts, addresses, handles and the elements
    /// of lists, a missing one as "null". Formats and what the runtime is to fill are left out.
    std::string arguments(std::string const &entryPoint) { return entries_[entryPoint].arguments; }

    /// The caller's references to each handle that it has any to.
    std::map<void const *, int> const &references() const { return references_; }

    /// Notes a call; the code with which it is to fail, or CL_SUCCESS.
    cl_int enter(std::string const &entryPoint, std::string const &arguments) {
        Entry &entry = entries_[entryPoint];
        entry.arguments = arguments;
        return ++entry.calls == entry.failing ? entry.code : CL_SUCCESS;
    }

    std::string answerTo(cl_uint query) { return answers_[query]; }

    /// Notes a reference more or less. A release too many stays as a negative count, for the test
    /// to see.
    void count(void const *handle, int change) {
        if (handle && (references_[handle] += change) == 0)
            references_.erase(handle);
    }

private:
    struct Entry {
        unsigned int calls = 0;
        std::string arguments;
        unsigned int failing = 0; ///< the call that fails; 0 for none
        cl_int code = CL_SUCCESS;
    };

    std::map<std::string, Entry> entries_;
    std::map<void const *, int> references_;
    std::map<cl_uint, std::string> answers_; ///< their bytes
};

} // namespace oru_test
