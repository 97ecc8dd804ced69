// The parts of the tests' runtime: the system's entry points, and what replaces some of them.
#pragma once

#include "oru/oru_ocl/functiontable.h"

#include <cstddef>
#include <optional>
#include <string>

namespace oru_test::runtime {

using ORU::OCL::FunctionTable;

/// The system's runtime, loaded by the first call.
FunctionTable const &System();

/// What is called instead of the system's entry points; null where nothing is.
FunctionTable const &Replacements();

/// Each part enters its replacements.
void ReplaceQueries(FunctionTable &table);
void ReplaceSharing(FunctionTable &table);

/// What the runtime pretends to be; set while nobody uses it.
struct Faces {
    std::optional<std::string> version;
    bool hasPlatforms = true;
    bool hasImages = true;
};
inline Faces faces;

/// Whether a command may use the memory object: one over an OpenGL object must be acquired.
bool MayUse(cl_mem memory);

/// The same for all memory objects that are arguments of the kernel.
bool MayUse(cl_kernel kernel);

/// The caller gave up its last reference.
void Forget(void const *handle);

/// Sets an error out-parameter that may be null, and gives the null result that goes with it.
inline std::nullptr_t Refuse(cl_int *error, cl_int code) {
    if (error)
        *error = code;
    return nullptr;
}

} // namespace oru_test::runtime
