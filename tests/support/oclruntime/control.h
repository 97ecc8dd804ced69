// How a test steers the tests' own OpenCL runtime.
#pragma once

#include "oru/oru_ocl/openclheaders.h"

namespace oru_test {

/// What the runtime's export OruTestRuntimeControl returns.
struct RuntimeControl {
    /// The `call`-th call of an entry point from now (1 is the next) does nothing and reports
    /// `code`.
    void (*fail)(char const *entryPoint, unsigned int call, cl_int code);

    /// Forgets the failures still to come, and how often what was called.
    void (*reset)();

    /// How often an entry point was called since the last reset.
    unsigned int (*calls)(char const *entryPoint);

    /// How many handles the caller holds references to.
    unsigned int (*liveHandles)();

    /// The caller's references to a handle; 0 for one it does not hold.
    int (*references)(void const *handle);

    /// @name Faces
    /// @{
    /// What every platform says its version is; null for what it really says.
    void (*setVersion)(char const *version);
    void (*setPlatforms)(bool some);
    void (*setImages)(bool supported);
    /// @}
};

using RuntimeControlFunction = RuntimeControl const *(*)();

} // namespace oru_test
