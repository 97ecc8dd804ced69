// The exports of the tests' runtime.

// The headers' declarations become those of exports.
#define CL_API_ENTRY __declspec(dllexport)
#define CL_USE_DEPRECATED_OPENCL_1_0_APIS
#define CL_USE_DEPRECATED_OPENCL_1_1_APIS
#define CL_USE_DEPRECATED_OPENCL_1_2_APIS
#include "tests/support/oclruntime/runtime.h"

#include <type_traits>

#include <windows.h>

namespace oru_test::runtime {

namespace {

FunctionTable LoadSystem() {
    wchar_t directory[MAX_PATH];
    UINT const length = GetSystemDirectoryW(directory, MAX_PATH);
    HMODULE const module =
        LoadLibraryW((std::wstring(directory, length) + L"\\OpenCL.dll").c_str());
    FunctionTable table;
#define ORU_CL_SLOT(Extension, Name)                                                               \
    table.Name = reinterpret_cast<decltype(table.Name)>(                                           \
        reinterpret_cast<void *>(GetProcAddress(module, #Name)));
#include "oru/oru_ocl/internal/functiontable_slots.inc"
    return table;
}

/// What is called: the system's entry points, some of them replaced.
FunctionTable const &Functions() {
    static FunctionTable const table = [] {
        FunctionTable functions = System();
        ReplaceQueries(functions);
        ReplaceSharing(functions);
        return functions;
    }();
    return table;
}

template<class Argument>
constexpr bool IsHandle = false;
template<class Object>
constexpr bool IsHandle<Object *> = std::is_class_v<Object> && !std::is_const_v<Object>;

/// Platforms and devices are not counted.
template<class Argument>
constexpr bool IsCounted = IsHandle<Argument> && !std::is_same_v<Argument, cl_platform_id> &&
                           !std::is_same_v<Argument, cl_device_id>;

/// The text of an argument as the call book wants it. `previous` is the number before it, which is
/// the length of a list.
template<class Argument>
std::string Recorded([[maybe_unused]] std::string const &name, [[maybe_unused]] Argument argument,
                     [[maybe_unused]] std::size_t &previous) {
    using Target = std::remove_pointer_t<Argument>;
    if constexpr (std::is_integral_v<Argument>) {
        previous = static_cast<std::size_t>(argument);
        return TextOf(argument);
    } else if constexpr (std::is_function_v<Target>) {
        return TextOf(reinterpret_cast<void const *>(argument));
    } else if constexpr (std::is_void_v<Target> || IsHandle<Argument>) {
        return TextOf(argument);
    } else if constexpr (std::is_same_v<Target, char const>) {
        return TextOf(argument ? argument : "null");
    } else if constexpr (std::is_same_v<Target, std::size_t const> ||
                         (std::is_const_v<Target> && IsHandle<std::remove_const_t<Target>>)) {
        bool const isPlace = std::is_same_v<Target, std::size_t const> &&
                             name.rfind("clEnqueue", 0) == 0 && name != "clEnqueueNDRangeKernel";
        std::string text = argument ? "" : TextOf("null");
        for (std::size_t i = 0; argument && i < (isPlace ? 3 : previous); ++i)
            text += TextOf(argument[i]);
        return text;
    } else if constexpr (std::is_same_v<Target, cl_context_properties const>) {
        std::string text;
        for (std::size_t i = 0; argument && argument[i] != 0; ++i)
            text += TextOf(argument[i]);
        return text;
    } else {
        return "";
    }
}

/// The result of a call that did nothing.
template<class Result, class... Arguments>
Result Failed([[maybe_unused]] cl_int code, [[maybe_unused]] Arguments... arguments) {
    if constexpr (std::is_same_v<Result, cl_int>) {
        return code;
    } else {
        auto const setError = [code](auto argument) {
            if constexpr (std::is_same_v<decltype(argument), cl_int *>)
                Refuse(argument, code);
        };
        (setError(arguments), ...);
        return nullptr;
    }
}

/// Notes the references that an argument of a successful call brought: `change` to a handle, one to
/// a received event, one to each received kernel.
template<class Argument>
void NoteReferences([[maybe_unused]] Argument argument, int change, std::size_t &previous) {
    if constexpr (std::is_integral_v<Argument>) {
        previous = static_cast<std::size_t>(argument);
    } else if constexpr (IsCounted<Argument>) {
        if (change != 0)
            TheCallBook().count(argument, change);
    } else if constexpr (IsCounted<std::remove_pointer_t<Argument>>) {
        std::size_t const received = std::is_same_v<Argument, cl_event *> ? 1 : previous;
        for (std::size_t i = 0; argument && i < received; ++i)
            TheCallBook().count(argument[i], 1);
    }
}

/// What an export does.
template<class Result, class... Parameters>
auto Call(std::string const &name, Result (CL_API_CALL *FunctionTable::*slot)(Parameters...)) {
    return [=](Parameters... arguments) -> Result {
        std::size_t previous = 0;
        std::string recorded;
        ((recorded += Recorded(name, arguments, previous)), ...);
        if (cl_int const code = TheCallBook().enter(name, recorded))
            return Failed<Result>(code, arguments...);
        auto const function = Functions().*slot;
        if (!function)
            return Failed<Result>(CL_INVALID_OPERATION, arguments...);
        Result const result = function(arguments...);
        if constexpr (IsCounted<Result>)
            TheCallBook().count(result, 1);
        if constexpr (std::is_same_v<Result, cl_int>) {
            int const change = (name.rfind("clRetain", 0) == 0) - (name.rfind("clRelease", 0) == 0);
            if (result == CL_SUCCESS)
                (NoteReferences(arguments, change, previous), ...);
        }
        return result;
    };
}

} // namespace

CallBook &TheCallBook() {
    static CallBook book;
    return book;
}

FunctionTable const &System() {
    static FunctionTable const table = LoadSystem();
    return table;
}

#define ORU_CL_ENTRY(Result, Name, Parameters, Arguments)                                          \
    extern "C" CL_API_ENTRY Result CL_API_CALL Name Parameters {                                   \
        return Call(#Name, &FunctionTable::Name) Arguments;                                        \
    }
#include "tests/support/oclruntime/entrypoints.inc"

} // namespace oru_test::runtime

extern "C" __declspec(dllexport) oru_test::CallBook *OruTestCallBook() {
    return &oru_test::runtime::TheCallBook();
}
