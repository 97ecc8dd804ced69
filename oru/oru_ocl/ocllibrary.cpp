// Start-up and shut-down of the OpenCL layer.
#include "oru/oru_ocl/ocllibrary.h"

#include "oru/core/exceptions/checks.h"
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

/// The runtime in the directory `path`, or in the system directory for an empty one; null when it
/// does not load.
HMODULE LoadRuntime(std::string const &path) {
    std::wstring file;
    if (path.empty()) {
        file = SystemDirectory();
        if (file.empty())
            return nullptr;
        file += L'\\';
    }
    for (char const c : path)
        file += static_cast<wchar_t>(static_cast<signed char>(c));
    file += L"OpenCL.dll";
    return LoadLibraryW(file.c_str());
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
    HMODULE const runtime = LoadRuntime(libraryPath_);
    ORU_ASSERT_TEXT("openCLLibraryHandle", runtime);
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
            HMODULE const module = LoadRuntime(path);
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
