// Start-up and shut-down of the OpenCL layer.
#include "oru/oru_ocl/ocllibrary.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ocl/extensionmanagerocl.h"
#include "oru/oru_ocl/internal/devicepropertytable.h"

#include <mutex>

#include <tbb/spin_mutex.h>
#include <windows.h>

namespace ORU::OCL {

namespace {

tbb::spin_mutex gMutex;

/// The runtime that the extension manager's table points into.
HMODULE gRuntime = nullptr;

/// The system directory without a trailing separator; empty when Windows does not tell.
std::wstring SystemDirectory() {
    std::wstring directory(MAX_PATH, L'\0');
    for (;;) {
        // The length without the terminator when it fits, with it when it does not.
        UINT const length =
            GetSystemDirectoryW(directory.data(), static_cast<UINT>(directory.size()));
        bool const fits = length < directory.size();
        directory.resize(length);
        if (fits)
            return directory;
    }
}

/// The file of the runtime in the directory `path`, or in the system directory for an empty one;
/// empty when Windows does not tell that.
std::wstring RuntimeFile(std::string const &path) {
    std::wstring file;
    if (path.empty()) {
        file = SystemDirectory();
        if (file.empty())
            return file;
        file += L'\\';
    }
    for (char const c : path)
        file += static_cast<wchar_t>(static_cast<signed char>(c));
    return file + L"OpenCL.dll";
}

/// Null when it does not load.
HMODULE LoadRuntime(std::wstring const &file) {
    return file.empty() ? nullptr : LoadLibraryW(file.c_str());
}

/// What a host should know of a runtime that does not load.
std::string WhyNoRuntime(std::wstring const &file, DWORD error) {
    std::string shown;
    for (wchar_t const c : file)
        shown += c < 0x80 ? static_cast<char>(c) : '?';
    return ComposeText("no OpenCL runtime at ", shown, " (Windows error ", error,
                       "): install a driver with OpenCL, or name the folder that holds it");
}

/// Takes over the reference to `module`, giving up the one held before.
void KeepRuntime(HMODULE module) {
    if (gRuntime)
        FreeLibrary(gRuntime);
    gRuntime = module;
}

bool HasPlatform(HMODULE module) {
    using GetPlatformIDs = decltype(FunctionTable::clGetPlatformIDs);
    auto const getPlatformIDs = reinterpret_cast<GetPlatformIDs>(
        reinterpret_cast<void *>(GetProcAddress(module, "clGetPlatformIDs")));
    cl_uint count = 0;
    if (getPlatformIDs)
        getPlatformIDs(0, nullptr, &count);
    return count > 0;
}

} // namespace

std::atomic<bool> Library::bInitialized_ = false;
std::string Library::libraryPath_;

void Library::Initialize() {
    std::lock_guard const lock(gMutex);
    InitializeLocked();
}

void Library::InitializeIfNecessary() {
    std::lock_guard const lock(gMutex);
    if (!bInitialized_)
        InitializeLocked();
}

void Library::InitializeLocked() {
    ORU_ASSERT(!bInitialized_);
    std::wstring const file = RuntimeFile(libraryPath_);
    HMODULE const runtime = LoadRuntime(file);
    ORU_ASSERT_NOTED("openCLLibraryHandle", WhyNoRuntime(file, GetLastError()), runtime);
    ExtensionManager const *const leftOver = ExtensionManager::instance();
    try {
        ExtensionManager::create(runtime);
        FillDevicePropertyTable();
    } catch (...) {
        // An instance that found no platform stays, and the runtime that it points into with it.
        if (ExtensionManager::instance() != leftOver)
            KeepRuntime(runtime);
        else
            FreeLibrary(runtime);
        throw;
    }
    KeepRuntime(runtime);
    bInitialized_ = true;
}

void Library::Terminate() {
    std::lock_guard const lock(gMutex);
    ORU_ASSERT(bInitialized_);
    bInitialized_ = false;
    libraryPath_.clear();
    ExtensionManager::destroy();
    KeepRuntime(nullptr);
}

bool Library::IsOpenCLAvailable(std::string const &path) {
    try {
        // A static whose initialiser throws is initialised again by the next call.
        static bool const kAvailable = [&] {
            std::string copy = path;
            HMODULE const module = LoadRuntime(RuntimeFile(path));
            {
                std::lock_guard const lock(gMutex);
                libraryPath_.swap(copy);
            }
            if (!module)
                return false;
            bool const hasPlatform = HasPlatform(module);
            FreeLibrary(module);
            return hasPlatform;
        }();
        return kAvailable;
    } catch (...) {
        return false;
    }
}

AutoInitializer::AutoInitializer() {
    Library::Initialize();
}

AutoInitializer::~AutoInitializer() {
    // When somebody else has terminated the layer, nothing is left to do.
    if (terminate_)
        DropExceptions([] { Library::Terminate(); });
}

} // namespace ORU::OCL
