// The OpenCL function table and the extensions whose entry points fill it.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/export.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/core/utility/windowsforward.h"
#include "oru/oru_ocl/extensionenum.h"
#include "oru/oru_ocl/functiontable.h"

#include <string>
#include <vector>

namespace ORU::OCL {

/// Owns the function table of the loaded runtime.
///
/// One instance exists from `Library::Initialize` to `Library::Terminate`. It resolves the OpenCL
/// 1.0 entry points, and those of 1.1 when the first platform offers them; a caller that wants an
/// extension's entry points calls the extension's `init_` operation and then reads `table()`.
class ORU_API ExtensionManager {
public:
    ExtensionManager(ExtensionManager const &) = delete;
    ExtensionManager &operator=(ExtensionManager const &) = delete;
    ~ExtensionManager();

    /// Frees the instance, if there is one. `Library::Terminate` does it; a host only needs it to
    /// try `Library::Initialize` again after a failure to enumerate platforms.
    static void destroy() noexcept;

    /// The instance; null while the layer is not initialised.
    static ExtensionManager *instance() { return extMgrInstance_; }

    /// The instance's table; null while there is no instance. One load, for the layer's own calls.
    static FunctionTable const *currentTable() { return sTable_; }

    /// The function table.
    /// @throws InternalException "table_ != 0"
    FunctionTable const &table() const {
        ORU_ASSERT_TEXT("table_ != 0", table_);
        return *table_;
    }

    // For each extension: init_NAME() resolves all its entry points with GetProcAddress and returns
    // whether every one was found (true for an extension without any); zero_NAME() does nothing and
    // returns true, since the table dies with the instance.
#include "oru/oru_ocl/extensionmanagerocl_operations.inc"

    /// The `init_` operation of the extension; false for a value that is none.
    bool initializeCL(Enum::Extension extension);

    /// Does nothing; whether the value is an extension.
    bool zeroSymbolsForExtensionCL(Enum::Extension extension);

    /// Does nothing.
    void zeroAllSymbolsCL();

    /// The extension of exactly this name, `EXTENSION_UNKNOWN` when it is none.
    static Enum::Extension nameToExtensionEnum(char const *name);
    /// The same.
    static Enum::Extension nameToExtensionEnum(std::string const &name);

    /// The extension's name as runtimes list it; empty for a value that is none.
    static std::string ExtensionEnumToString(Enum::Extension extension);

private:
    friend class Library;

    explicit ExtensionManager(HINSTANCE library);

    static ExtensionManager *create(HINSTANCE library);

    bool resolve(Enum::Extension extension);

    static ExtensionManager *extMgrInstance_;
    static FunctionTable const *sTable_;

    HINSTANCE library_;
    ScopedPtr<FunctionTable> table_;
};

/// Appends the words of `text`, which blanks and tabs separate, to `tokens`.
ORU_API void TokenizeExtensionString(std::string const &text, std::vector<std::string> &tokens);

} // namespace ORU::OCL
