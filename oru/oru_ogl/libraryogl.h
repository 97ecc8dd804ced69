// Start-up and shut-down of the OpenGL layer.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/oru_ogl/exceptionogl.h" // what a host catches

#include <iosfwd>

/// The OpenGL layer: contexts, the checked calls, and the objects that live in contexts.
namespace ORU::OGL {

/// Opens and closes a host's use of the OpenGL layer; static members only.
///
/// Start-up makes no OpenGL call: what a display device can do is found out when the first context
/// is made on it.
class ORU_API Library {
public:
    /// Options of the layer, kept for the host; nothing in the layer acts on them. Those that
    /// contexts and records copy are `ExtensionManager::InitOptions`.
    class InitOptions {
    public:
        bool throwOnNullContext() const { return throwOnNullContext_; } ///< true unless set
        /// Nothing acts on it.
        void setThrowOnNullContext(bool value) { throwOnNullContext_ = value; }
        /// True unless set.
        bool flushOnMakeCurrentMacOnly() const { return flushOnMakeCurrentMacOnly_; }
        /// Nothing acts on it.
        void setFlushOnMakeCurrentMacOnly(bool value) { flushOnMakeCurrentMacOnly_ = value; }

    private:
        bool throwOnNullContext_ = true;
        bool flushOnMakeCurrentMacOnly_ = true;
    };

    /// Opens the layer.
    /// @throws InternalException when it is open already; the first options then stay
    static void Initialize(InitOptions const &options);

    /// Whether the layer is open.
    static bool IsInitialized();

    /// Closes the layer: destroys both interceptor chains and every capability record of a display
    /// device. Contexts must be gone and decorators popped before.
    /// @throws InternalException when a decorator is still pushed (the rest is then left as it
    ///         is), or, after all is cleaned up, when the layer was not open
    static void Terminate();

    Library &operator=(Library const &) = default;

private:
    static bool sIsInitialized_;
    static InitOptions sInitOptions_;
    // Two files that nothing opens; they have their place in the binary interface.
    static std::fstream *sSrcFile_;
    static std::fstream *sBinFile_;
};

/// Keeps the layer open for a scope.
class ORU_API AutoInitializer {
public:
    /// Opens the layer with default options.
    /// @throws InternalException when it is open already
    AutoInitializer();

    /// Opens the layer.
    /// @throws InternalException when it is open already
    explicit AutoInitializer(Library::InitOptions const &options);

    /// Closes the layer unless released; a failure to do so is dropped.
    ~AutoInitializer();

    AutoInitializer(AutoInitializer const &) = delete;
    AutoInitializer &operator=(AutoInitializer const &) = delete;

    /// Leaves closing to the host.
    void release() { active_ = false; }

private:
    bool active_;
};

} // namespace ORU::OGL
