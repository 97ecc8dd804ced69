// The library, and the system that it runs on.
#include "apps/common/unicode.h"
#include "apps/oruinfo/report.h"
#include "apps/oruinfo/sections.h"

#include "oru/version.h"

#include <windows.h>

namespace OruInfo {

namespace {

std::string Compiler() {
#if defined(__clang__)
    return "Clang " __clang_version__;
#elif defined(__GNUC__)
    return "GCC " __VERSION__;
#else
    return "MSVC " + std::to_string(_MSC_FULL_VER);
#endif
}

std::string FileOf(HMODULE module) {
    std::wstring path(MAX_PATH, L'\0');
    DWORD length = 0;
    while ((length = ::GetModuleFileNameW(module, path.data(), static_cast<DWORD>(path.size()))) ==
           path.size())
        path.resize(path.size() * 2);
    path.resize(length);
    return App::ToUtf8(path);
}

/// The module that a function lies in.
HMODULE ModuleOf(void const *function) {
    HMODULE module = nullptr;
    ::GetModuleHandleExW(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS |
                             GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
                         static_cast<LPCWSTR>(function), &module);
    return module;
}

/// The true version; GetVersion tells programs without a manifest an old one.
Value WindowsVersion() {
    using RtlGetVersion = LONG(WINAPI *)(OSVERSIONINFOW *);
    auto const getVersion = reinterpret_cast<RtlGetVersion>(reinterpret_cast<void *>(
        ::GetProcAddress(::GetModuleHandleW(L"ntdll.dll"), "RtlGetVersion")));
    OSVERSIONINFOW version = {};
    version.dwOSVersionInfoSize = sizeof version;
    if (!getVersion || getVersion(&version) != 0)
        return Unavailable{"the system does not tell"};
    return std::to_string(version.dwMajorVersion) + "." + std::to_string(version.dwMinorVersion) +
           "." + std::to_string(version.dwBuildNumber);
}

Value Memory() {
    MEMORYSTATUSEX status = {};
    status.dwLength = sizeof status;
    if (!::GlobalMemoryStatusEx(&status))
        return Unavailable{"the system does not tell"};
    return {std::uint64_t{status.ullTotalPhys}, "bytes"};
}

} // namespace

void GatherLibrary(Drivers &, Group &section) {
    HMODULE const library = ModuleOf(reinterpret_cast<void const *>(&ORU::Version));
    section.add("version", "Version", std::string(ORU::Version()));
    section.add("header_version", "Version of its headers", std::string(ORU_VERSION_STRING));
    section.add("file", "File", FileOf(library));
    section.add("compiler", "Compiler", Compiler());
#ifdef NDEBUG
    section.add("is_debug_build", "Debug build", false);
#else
    section.add("is_debug_build", "Debug build", true);
#endif
    section.add("windows", "Windows", WindowsVersion());
    section.add("processors", "Processors",
                std::uint64_t{::GetActiveProcessorCount(ALL_PROCESSOR_GROUPS)});
    section.add("memory", "Memory", Memory());
}

} // namespace OruInfo
