// The OpenCL function table and the extensions whose entry points fill it.

// The table is held against all declarations of the headers, deprecated ones included.
#define CL_USE_DEPRECATED_OPENCL_1_0_APIS
#define CL_USE_DEPRECATED_OPENCL_1_1_APIS
#define CL_USE_DEPRECATED_OPENCL_1_2_APIS
#include "oru/oru_ocl/extensionmanagerocl.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/tokenize.h"
#include "oru/oru_ocl/internal/versiontext.h"

#include <algorithm>
#include <cstddef>
#include <cstring>
#include <iterator>
#include <string_view>
#include <type_traits>

#include <windows.h>

namespace ORU::OCL {

namespace {

#define ORU_CL_SLOT(Extension, Name)                                                               \
    static_assert(std::is_same_v<decltype(FunctionTable::Name), decltype(&::Name)>, #Name);
#include "oru/oru_ocl/internal/functiontable_slots.inc"

struct Slot {
    Enum::Extension extension;
    char const *name;
    std::size_t offset;
};

constexpr Slot kSlots[] = {
#define ORU_CL_SLOT(Extension, Name) {Enum::Extension, #Name, offsetof(FunctionTable, Name)},
#include "oru/oru_ocl/internal/functiontable_slots.inc"
};

static_assert(sizeof(FunctionTable) == std::size(kSlots) * sizeof(FARPROC));

/// The extensions' names; an extension's value is its index.
constexpr char const *kExtensionNames[] = {
#define ORU_CL_EXTENSION(Extension, Name) #Name,
#include "oru/oru_ocl/internal/extensions.inc"
};

#define ORU_CL_EXTENSION(Extension, Name)                                                          \
    static_assert(std::string_view(kExtensionNames[Enum::Extension]) == #Name);
#include "oru/oru_ocl/internal/extensions.inc"

bool IsExtension(Enum::Extension extension) {
    return static_cast<std::size_t>(extension) < std::size(kExtensionNames);
}

Enum::Extension ExtensionOf(std::string_view name) {
    auto const *const found =
        std::find(std::begin(kExtensionNames), std::end(kExtensionNames), name);
    return found == std::end(kExtensionNames)
               ? Enum::EXTENSION_UNKNOWN
               : static_cast<Enum::Extension>(found - std::begin(kExtensionNames));
}

Version PlatformVersion(FunctionTable const &table, cl_platform_id platform) {
    std::size_t size = 0;
    cl_int error = table.clGetPlatformInfo(platform, CL_PLATFORM_VERSION, 0, nullptr, &size);
    ORU_ASSERT(CL_SUCCESS == error);
    std::vector<char> bytes(size + 1);
    error = table.clGetPlatformInfo(platform, CL_PLATFORM_VERSION, size, bytes.data(), nullptr);
    ORU_ASSERT(CL_SUCCESS == error);
    return ParseVersion(bytes.data());
}

std::vector<Version> PlatformVersions(FunctionTable const &table) {
    cl_uint count = 0;
    cl_int error = table.clGetPlatformIDs(0, nullptr, &count);
    ORU_ASSERT(CL_SUCCESS == error);
    std::vector<cl_platform_id> platforms(count);
    error = table.clGetPlatformIDs(count, platforms.data(), nullptr);
    ORU_ASSERT(CL_SUCCESS == error);
    std::vector<Version> versions;
    versions.reserve(platforms.size());
    for (cl_platform_id platform : platforms)
        versions.push_back(PlatformVersion(table, platform));
    return versions;
}

} // namespace

ExtensionManager *ExtensionManager::extMgrInstance_ = nullptr;
FunctionTable const *ExtensionManager::sTable_ = nullptr;

ExtensionManager::ExtensionManager(HINSTANCE library)
    : library_(library), table_(ORU_NEW FunctionTable) {
    bool const isInitialized = init_CL_VERSION_1_0();
    ORU_ASSERT(isInitialized);
}

ExtensionManager::~ExtensionManager() = default;

ExtensionManager *ExtensionManager::create(HINSTANCE library) {
    ORU_ASSERT(library);
    ORU_ASSERT(extMgrInstance_ == 0);
    extMgrInstance_ = ORU_NEW ExtensionManager(library);
    ORU_ASSERT(extMgrInstance_);
    sTable_ = extMgrInstance_->table_.get();
    std::vector<Version> const versions = PlatformVersions(extMgrInstance_->table());
    ORU_ASSERT_TEXT("platformVersions.size() > 0", !versions.empty());
    // The loader exports one set of entry points for all platforms; the first platform decides, so
    // that a caller finds the same slots however many runtimes are installed beside it.
    Version const version = versions.front();
    if (version.major > 1 || (version.major == 1 && version.minor > 0))
        extMgrInstance_->init_CL_VERSION_1_1();
    return extMgrInstance_;
}

void ExtensionManager::destroy() noexcept {
    sTable_ = nullptr;
    ORUDeleter<ExtensionManager>()(extMgrInstance_);
    extMgrInstance_ = nullptr;
}

bool ExtensionManager::resolve(Enum::Extension extension) {
    bool complete = true;
    for (Slot const &slot : kSlots) {
        if (slot.extension != extension)
            continue;
        FARPROC const function = GetProcAddress(library_, slot.name);
        std::memcpy(reinterpret_cast<char *>(table_.get()) + slot.offset, &function,
                    sizeof function);
        complete = complete && function;
    }
    return complete;
}

#define ORU_CL_EXTENSION(Extension, Name)                                                          \
    bool ExtensionManager::init_##Name() {                                                         \
        return resolve(Enum::Extension);                                                           \
    }                                                                                              \
    bool ExtensionManager::zero_##Name() {                                                         \
        return true;                                                                               \
    }
#include "oru/oru_ocl/internal/extensions.inc"

bool ExtensionManager::initializeCL(Enum::Extension extension) {
    return IsExtension(extension) && resolve(extension);
}

bool ExtensionManager::zeroSymbolsForExtensionCL(Enum::Extension extension) {
    return IsExtension(extension);
}

void ExtensionManager::zeroAllSymbolsCL() {}

Enum::Extension ExtensionManager::nameToExtensionEnum(char const *name) {
    return ExtensionOf(name);
}

Enum::Extension ExtensionManager::nameToExtensionEnum(std::string const &name) {
    return ExtensionOf(name);
}

std::string ExtensionManager::ExtensionEnumToString(Enum::Extension extension) {
    return IsExtension(extension) ? kExtensionNames[extension] : std::string();
}

void TokenizeExtensionString(std::string const &text, std::vector<std::string> &tokens) {
    Tokenize(text, " \t", tokens);
}

} // namespace ORU::OCL
