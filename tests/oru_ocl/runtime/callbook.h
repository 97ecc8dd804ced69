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
    static CallBook &Instance();

    /// Counts a call; the code with which it is to fail, or CL_SUCCESS.
    cl_int enter(char const *entryPoint);

    void fail(char const *entryPoint, unsigned int call, cl_int code);
    void reset();
    unsigned int calls(char const *entryPoint);

    /// Notes a reference more.
    void add(void const *handle);

    /// Notes a reference less; whether it was the last.
    bool remove(void const *handle);

    unsigned int liveHandles();
    int references(void const *handle);

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
