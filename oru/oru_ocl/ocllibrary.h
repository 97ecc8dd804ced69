// Start-up and shut-down of the OpenCL layer.
#pragma once

#include "oru/core/utility/export.h"

#include <atomic>
#include <string>

/// The compute layer: the OpenCL runtime, loaded when it is asked for, and its objects as values.
namespace ORU::OCL {

/// Loads and unloads the OpenCL runtime.
///
/// Every object of the layer needs the initialised state, and must be gone before `Terminate`.
/// The functions that change the state may be called from any thread at any time.
class ORU_API Library {
public:
    /// Loads OpenCL.dll, resolves its entry points and fills the device-property table.
    /// The runtime comes from the directory last given to `IsOpenCLAvailable`, else from the
    /// system directory.
    /// @throws InternalException "!bInitialized_" when already initialised, "openCLLibraryHandle"
    ///     when there is no runtime, "isInitialized" when it lacks an OpenCL 1.0 entry point,
    ///     "CL_SUCCESS == error" or "platformVersions.size() > 0" when it has no platform.
    ///     After the last two, `ExtensionManager::destroy()` must precede another attempt.
    /// @throws std::out_of_range when a platform's version is shorter than "OpenCL "
    static void Initialize();

    /// `Initialize` unless the layer is initialised already.
    static void InitializeIfNecessary();

    /// Frees the function table and unloads the runtime; forgets its directory.
    /// @throws InternalException "bInitialized_" when the layer is not initialised
    static void Terminate();

    /// Whether the layer is initialised.
    static bool IsInitialized() { return bInitialized_; }

    /// Whether a runtime with at least one platform can be loaded; computed by the first call in
    /// the process, which also settles where `Initialize` looks.
    /// @param path directory of OpenCL.dll with its trailing separator, single-byte characters;
    ///     empty for the system directory. Later calls ignore it.
    static bool IsOpenCLAvailable(std::string const &path);

private:
    static void InitializeLocked();

    static std::atomic<bool> bInitialized_;
    static std::string libraryPath_;
};

/// Keeps the layer initialised for a scope.
class ORU_API AutoInitializer {
public:
    /// Opens the layer.
    /// @throws what `Library::Initialize` throws
    AutoInitializer();

    /// Terminates the layer unless released; lets no exception out.
    ~AutoInitializer();

    AutoInitializer(AutoInitializer const &) = delete;
    AutoInitializer &operator=(AutoInitializer const &) = delete;

    /// Leaves the layer initialised after the scope.
    void release() { terminate_ = false; }

private:
    bool terminate_ = true;
};

} // namespace ORU::OCL
