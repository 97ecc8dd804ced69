// The exports of the tests' runtime.

// The headers' declarations become those of exports.
#define CL_API_ENTRY __declspec(dllexport)
#define CL_USE_DEPRECATED_OPENCL_1_0_APIS
#define CL_USE_DEPRECATED_OPENCL_1_1_APIS
#define CL_USE_DEPRECATED_OPENCL_1_2_APIS
#include "tests/support/oclruntime/callbook.h"
#include "tests/support/oclruntime/control.h"
#include "tests/support/oclruntime/runtime.h"

#include <string_view>
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

constexpr bool StartsWith(std::string_view name, std::string_view prefix) {
    return name.substr(0, prefix.size()) == prefix;
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

/// Whether an enqueued command may use an argument.
template<class Argument>
bool Usable([[maybe_unused]] Argument argument) {
    if constexpr (std::is_same_v<Argument, cl_mem> || std::is_same_v<Argument, cl_kernel>)
        return MayUse(argument);
    else
        return true;
}

template<class Handle, class... Kinds>
constexpr bool IsOneOf = (std::is_same_v<Handle, Kinds> || ...);
template<class Handle>
constexpr bool IsCounted = IsOneOf<Handle, cl_context, cl_command_queue, cl_mem, cl_sampler,
                                   cl_program, cl_kernel, cl_event>;

bool Count(void const *handle, int change) {
    return handle && CallBook::Instance().count(handle, change);
}

[[maybe_unused]] void NoteKernels(cl_program, cl_uint count, cl_kernel *kernels, cl_uint *) {
    for (cl_uint i = 0; kernels && i < count; ++i)
        Count(kernels[i], 1);
}

/// Notes the reference that goes with an argument: the handle's own one, or a received event's.
template<int Change, class Argument>
void NoteArgument([[maybe_unused]] Argument argument) {
    if constexpr (std::is_same_v<Argument, cl_event *>)
        Count(argument ? *argument : nullptr, 1);
    else if constexpr (Change != 0 && IsCounted<Argument>)
        if (Count(argument, Change))
            Forget(argument);
}

/// What became of the caller's references by a call that succeeded.
template<class Name, class Result, class... Arguments>
void Note([[maybe_unused]] Result result, [[maybe_unused]] Arguments... arguments) {
    constexpr std::string_view name = Name::text();
    constexpr int change = StartsWith(name, "clRetain") - StartsWith(name, "clRelease");
    if constexpr (IsCounted<Result>)
        Count(result, 1);
    else if constexpr (name == "clCreateKernelsInProgram")
        NoteKernels(arguments...);
    else
        (NoteArgument<change>(arguments), ...);
}

/// What an export does.
template<class Name, class Result, class... Parameters>
auto Call(Result (CL_API_CALL *FunctionTable::*slot)(Parameters...)) {
    return [slot](Parameters... arguments) -> Result {
        constexpr std::string_view name = Name::text();
        if (cl_int const code = CallBook::Instance().enter(Name::text()))
            return Failed<Result>(code, arguments...);
        auto const function = Replacements().*slot ? Replacements().*slot : System().*slot;
        bool allowed = function && (faces.hasImages || !StartsWith(name, "clCreateImage"));
        if constexpr (StartsWith(name, "clEnqueue"))
            allowed = allowed && (Usable(arguments) && ...);
        if (!allowed)
            return Failed<Result>(CL_INVALID_OPERATION, arguments...);
        Result const result = function(arguments...);
        bool succeeded = true;
        if constexpr (std::is_same_v<Result, cl_int>)
            succeeded = result == CL_SUCCESS;
        if (succeeded)
            Note<Name>(result, arguments...);
        return result;
    };
}

} // namespace

FunctionTable const &System() {
    static FunctionTable const table = LoadSystem();
    return table;
}

FunctionTable const &Replacements() {
    static FunctionTable const table = [] {
        FunctionTable replacements;
        ReplaceQueries(replacements);
        ReplaceSharing(replacements);
        return replacements;
    }();
    return table;
}

#define ORU_CL_ENTRY(Result, Name, Parameters, Arguments)                                          \
    namespace {                                                                                    \
    struct NameOf_##Name {                                                                         \
        static constexpr char const *text() { return #Name; }                                      \
    };                                                                                             \
    }                                                                                              \
    extern "C" CL_API_ENTRY Result CL_API_CALL Name Parameters {                                   \
        return Call<NameOf_##Name>(&FunctionTable::Name) Arguments;                                \
    }
#include "tests/support/oclruntime/entrypoints.inc"

} // namespace oru_test::runtime

extern "C" __declspec(dllexport) oru_test::RuntimeControl const *OruTestRuntimeControl() {
    using namespace oru_test::runtime;
    static oru_test::RuntimeControl const control = {
        [](char const *entryPoint, unsigned int call, cl_int code) {
            CallBook::Instance().fail(entryPoint, call, code);
        },
        [] { CallBook::Instance().reset(); },
        [](char const *entryPoint) { return CallBook::Instance().calls(entryPoint); },
        [] { return CallBook::Instance().liveHandles(); },
        [](void const *handle) { return CallBook::Instance().references(handle); },
        [](char const *version) {
            faces.version = version ? std::optional<std::string>(version) : std::nullopt;
        },
        [](bool some) { faces.hasPlatforms = some; },
        [](bool supported) { faces.hasImages = supported; },
    };
    return &control;
}
