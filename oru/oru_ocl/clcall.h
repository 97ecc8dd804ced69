// The short form of OpenCL calls through the function table, with errors as exceptions.
#pragma once

#include "oru/oru_ocl/extensionmanagerocl.h"

#include <type_traits>

namespace ORU::OCL {

/// The function table.
/// @throws InternalException "table_ != 0" when the layer is not initialised
inline FunctionTable const &Table() {
    FunctionTable const *const table_ = ExtensionManager::currentTable();
    ORU_ASSERT(table_ != 0);
    return *table_;
}

/// Throws `ExceptionOCL` with an empty message.
[[noreturn]] ORU_API ORU_COLD void ThrowOCL(char const *file, unsigned int line, cl_int code);

/// One entry point at one place of the source; what `ORU_CL` makes.
template<class Function>
struct CheckedCall {
    Function function;
    char const *file;
    unsigned int line;

    /// Calls the entry point. One that reports its error through a last argument is called without
    /// that argument and its result returned; of the others the result is the error.
    template<class... Arguments>
    auto operator()(Arguments... arguments) const {
        if constexpr (std::is_invocable_v<Function, Arguments..., cl_int *>) {
            cl_int error = CL_SUCCESS;
            auto const result = function(arguments..., &error);
            check(error);
            return result;
        } else {
            check(function(arguments...));
        }
    }

private:
    void check(cl_int error) const {
        if (error != CL_SUCCESS)
            ThrowOCL(file, line, error);
    }
};

template<class Function>
CheckedCall(Function, char const *, unsigned int) -> CheckedCall<Function>;

} // namespace ORU::OCL

/// `ORU_CL(CreateBuffer)(context, flags, size, host)` calls clCreateBuffer of the function table,
/// which must have it: the entry points of OpenCL 1.0 always, others where `table()` shows them.
/// Throws InternalException "table_ != 0" before the call, ExceptionOCL with this source position
/// when it fails.
#define ORU_CL(Name)                                                                               \
    ::ORU::OCL::CheckedCall {                                                                      \
        ::ORU::OCL::Table().cl##Name, __FILE__, __LINE__                                           \
    }
