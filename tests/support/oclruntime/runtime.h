// The parts of the tests' runtime: the system's entry points, and what replaces some of them.
#pragma once

#include "oru/oru_ocl/functiontable.h"
#include "tests/support/oclruntime/callbook.h"

#include <cstddef>

namespace oru_test::runtime {

using ORU::OCL::FunctionTable;

CallBook &TheCallBook();

/// The system's runtime, loaded by the first call.
FunctionTable const &System();

/// Each part puts its replacements over the system's entry points.
void ReplaceQueries(FunctionTable &table);
void ReplaceSharing(FunctionTable &table);

/// Sets an error out-parameter that may be null, and gives the null result that goes with it.
inline std::nullptr_t Refuse(cl_int *error, cl_int code) {
    if (error)
        *error = code;
    return nullptr;
}

} // namespace oru_test::runtime
