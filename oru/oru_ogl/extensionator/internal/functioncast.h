// Gives an address that the platform looked up its real type.
#pragma once

#include "oru/core/utility/windowsforward.h"

#include <cstring>

namespace ORU::OGL::internal {

/// The address as a pointer to a function of another type. A plain cast between function types
/// draws warnings that are right everywhere but here.
template<class Function>
Function FunctionCast(PROC address) {
    static_assert(sizeof(Function) == sizeof address, "function pointers have one size");
    Function function;
    std::memcpy(&function, &address, sizeof function);
    return function;
}

} // namespace ORU::OGL::internal
