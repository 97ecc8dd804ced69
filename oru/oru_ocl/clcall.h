// The short form of OpenCL calls through the function table, with errors as exceptions.
#pragma once

#include "oru/oru_ocl/extensionmanagerocl.h"

#include <cstddef>
#include <tuple>
#include <type_traits>
#include <utility>

namespace ORU::OCL {

/// The function table.
/// @throws InternalException "table_ != 0" when the layer is not initialised
inline FunctionTable const &Table() {
    FunctionTable const *const table = ExtensionManager::currentTable();
    ORU_ASSERT_TEXT("table_ != 0", table);
    return *table;
}

/// Throws `ExceptionOCL` with an empty message.
[[noreturn]] ORU_API ORU_COLD void ThrowOCL(char const *file, unsigned int line, cl_int code);

/// The same with a note that names the function, and the code where `ErrorToCString` does not.
[[noreturn]] ORU_API ORU_COLD void ThrowOCL(char const *file, unsigned int line, cl_int code,
                                            char const *function);

/// Whether an entry point reports its error through a last argument instead of its result.
template<class Result, class... Parameters>
constexpr bool kReportsByArgument =
    !std::is_same_v<Result, cl_int> &&
    std::is_same_v<std::tuple_element_t<sizeof...(Parameters), std::tuple<int, Parameters...>>,
                   cl_int *>;

/// One entry point at one place of the source, called with the parameters of `Indices`.
template<class Function, class Indices>
struct CheckedCall;

template<class Result, class... Parameters, std::size_t... Indices>
struct CheckedCall<Result(CL_API_CALL *)(Parameters...), std::index_sequence<Indices...>> {
    Result(CL_API_CALL *function)(Parameters...);
    char const *file;
    unsigned int line;
    char const *name;

    /// Calls the entry point; without its last argument and for its result when that argument
    /// reports the error, for nothing when the result is the error.
    auto operator()(std::tuple_element_t<Indices, std::tuple<Parameters...>>... arguments) const {
        if constexpr (sizeof...(Indices) < sizeof...(Parameters)) {
            cl_int error = CL_SUCCESS;
            Result const result = function(arguments..., &error);
            Check(file, line, error, name);
            return result;
        } else {
            Check(file, line, function(arguments...), name);
        }
    }

private:
    /// Static, so that nothing needs the object in memory: the place stays in the throwing branch.
    static void Check(char const *file, unsigned int line, cl_int error, char const *name) {
        if (error != CL_SUCCESS)
            ThrowOCL(file, line, error, name);
    }
};

/// The call of an entry point, for `ORU_CL`.
template<class Result, class... Parameters>
auto MakeCheckedCall(Result(CL_API_CALL *function)(Parameters...), char const *file,
                     unsigned int line, char const *name) {
    constexpr std::size_t kCount =
        sizeof...(Parameters) - (kReportsByArgument<Result, Parameters...> ? 1 : 0);
    return CheckedCall<decltype(function), std::make_index_sequence<kCount>>{function, file, line,
                                                                             name};
}

} // namespace ORU::OCL

/// `ORU_CL(CreateBuffer, context, flags, size, host)` calls clCreateBuffer of the function table,
/// which must have it: the entry points of OpenCL 1.0 always, others where `table()` shows them.
/// Throws InternalException "table_ != 0" before the call, ExceptionOCL with this source position
/// and a note of the function when it fails.
#define ORU_CL(Name, ...)                                                                          \
    ::ORU::OCL::MakeCheckedCall(::ORU::OCL::Table().cl##Name, __FILE__, __LINE__,                  \
                                "cl" #Name)(__VA_ARGS__)
