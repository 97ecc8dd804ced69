// The exports of the tests' runtime.

// The headers' declarations become those of exports.
#define CL_API_ENTRY __declspec(dllexport)
#define CL_USE_DEPRECATED_OPENCL_1_0_APIS
#define CL_USE_DEPRECATED_OPENCL_1_1_APIS
#define CL_USE_DEPRECATED_OPENCL_1_2_APIS
#include "callbook.h"
#include "control.h"
#include "runtime.h"

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
#include "oru/oru_ocl/functiontable_slots.inc"
    return table;
}

constexpr bool StartsWith(std::string_view name, std::string_view prefix) {
    return name.substr(0, prefix.size()) == prefix;
}

/// The result of a call that did nothing.
template<class Result, class... Arguments>
Result Failed(cl_int code, Arguments... arguments) {
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

template<class Handle>
constexpr bool IsCounted =
    std::is_same_v<Handle, cl_context> || std::is_same_v<Handle, cl_command_queue> ||
    std::is_same_v<Handle, cl_mem> || std::is_same_v<Handle, cl_sampler> ||
    std::is_same_v<Handle, cl_program> || std::is_same_v<Handle, cl_kernel> ||
    std::is_same_v<Handle, cl_event>;

/// Notes the reference that the caller received through an argument.
template<class Argument>
void NoteReceived([[maybe_unused]] Argument argument) {
    if constexpr (std::is_same_v<Argument, cl_event *>)
        if (argument && *argument)
            CallBook::Instance().add(*argument);
}

[[maybe_unused]] void NoteKernels(cl_program, cl_uint count, cl_kernel *kernels, cl_uint *) {
    for (cl_uint i = 0; kernels && i < count; ++i)
        CallBook::Instance().add(kernels[i]);
}

template<class Handle>
void NoteReleased(Handle handle) {
    if (CallBook::Instance().remove(handle))
        Forget(handle);
}

/// What became of the caller's references by a call that succeeded.
template<class Name, class Result, class... Arguments>
void Note(Result result, Arguments... arguments) {
    constexpr std::string_view name = Name::text();
    CallBook &book = CallBook::Instance();
    if constexpr (IsCounted<Result>) {
        if (result)
            book.add(result);
    } else if constexpr (name == "clCreateKernelsInProgram") {
        NoteKernels(arguments...);
    } else if constexpr (StartsWith(name, "clRetain") && (IsCounted<Arguments> && ...)) {
        book.add(arguments...);
    } else if constexpr (StartsWith(name, "clRelease") && (IsCounted<Arguments> && ...)) {
        NoteReleased(arguments...);
    } else {
        (NoteReceived(arguments), ...);
    }
}

/// One exported function.
template<class Name, class Result, class... Parameters>
struct Entry {
    Result (CL_API_CALL *FunctionTable::*slot)(Parameters...);

    Result operator()(Parameters... arguments) const {
        if (cl_int const code = CallBook::Instance().enter(Name::text()))
            return Failed<Result>(code, arguments...);
        auto const function = Replacements().*slot ? Replacements().*slot : System().*slot;
        if (!function)
            return Failed<Result>(CL_INVALID_OPERATION, arguments...);
        if constexpr (StartsWith(Name::text(), "clEnqueue"))
            if (!(Usable(arguments) && ...))
                return Failed<Result>(CL_INVALID_OPERATION, arguments...);
        Result const result = function(arguments...);
        bool succeeded = true;
        if constexpr (std::is_same_v<Result, cl_int>)
            succeeded = result == CL_SUCCESS;
        if (succeeded)
            Note<Name>(result, arguments...);
        return result;
    }
};

template<class Name, class Result, class... Parameters>
Entry<Name, Result, Parameters...>
EntryOf(Result (CL_API_CALL *FunctionTable::*slot)(Parameters...)) {
    return {slot};
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

#define ORU_CL_EXPORT(Result, Name, Parameters, Arguments)                                         \
    namespace {                                                                                    \
    struct NameOf_##Name {                                                                         \
        static constexpr char const *text() { return #Name; }                                      \
    };                                                                                             \
    }                                                                                              \
    extern "C" CL_API_ENTRY Result CL_API_CALL Name Parameters {                                   \
        return EntryOf<NameOf_##Name>(&FunctionTable::Name) Arguments;                             \
    }

// The older faces lack whole groups.
#ifdef ORU_TEST_WITHOUT_1_0
#define ORU_CL_EXPORTS_EXTENSION_VERSION_1_0(...)
#else
#define ORU_CL_EXPORTS_EXTENSION_VERSION_1_0(...) ORU_CL_EXPORT(__VA_ARGS__)
#endif
#ifdef ORU_TEST_WITHOUT_1_1
#define ORU_CL_EXPORTS_EXTENSION_VERSION_1_1(...)
#else
#define ORU_CL_EXPORTS_EXTENSION_VERSION_1_1(...) ORU_CL_EXPORT(__VA_ARGS__)
#endif
#define ORU_CL_EXPORTS_EXTENSION_EXT_DEVICE_FISSION(...) ORU_CL_EXPORT(__VA_ARGS__)
#define ORU_CL_EXPORTS_EXTENSION_EXT_MIGRATE_MEMOBJECT(...) ORU_CL_EXPORT(__VA_ARGS__)
#define ORU_CL_EXPORTS_EXTENSION_KHR_GL_EVENT(...) ORU_CL_EXPORT(__VA_ARGS__)
#define ORU_CL_EXPORTS_EXTENSION_KHR_GL_SHARING(...) ORU_CL_EXPORT(__VA_ARGS__)
#define ORU_CL_EXPORTS_EXTENSION_KHR_ICD(...) ORU_CL_EXPORT(__VA_ARGS__)

#define ORU_CL_ENTRY(Extension, Result, Name, Parameters, Arguments)                               \
    ORU_CL_EXPORTS_##Extension(Result, Name, Parameters, Arguments)
#include "tests/oru_ocl/runtime/entrypoints.inc"

} // namespace oru_test::runtime

extern "C" __declspec(dllexport) oru_test::RuntimeControl const *OruTestRuntimeControl() {
    using oru_test::runtime::CallBook;
    static oru_test::RuntimeControl const control = {
        [](char const *entryPoint, unsigned int call, cl_int code) {
            CallBook::Instance().fail(entryPoint, call, code);
        },
        [] { CallBook::Instance().reset(); },
        [](char const *entryPoint) { return CallBook::Instance().calls(entryPoint); },
        [] { return CallBook::Instance().liveHandles(); },
        [](void const *handle) { return CallBook::Instance().references(handle); },
        oru_test::runtime::SetVersion,
        oru_test::runtime::SetPlatforms,
        oru_test::runtime::SetImages,
    };
    return &control;
}
