// The chain through which the library makes its WGL calls.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/core/utility/windowsforward.h"

namespace ORU::OGL {

class WGLInterceptorDecorator;

/// A link of the WGL chain: one operation `wcgm<Name>` per WGL function `wgl<Name>`.
///
/// Each operation takes the caller's file and line in front of the WGL arguments. The last link, a
/// WGLErrorChecker, only makes the call: whoever calls tests the result. The chain is process-wide
/// and not locked.
class ORU_API WGLInterceptor {
public:
#define ORU_WGL_OPERATION(Result, Name, Parameters, Arguments)                                     \
    virtual Result wcgm##Name Parameters = 0;
#include "oru/oru_ogl/extensionator/wgl/wgloperations.inc"

    /// The first link of the chain; the first call makes the WGLErrorChecker.
    static WGLInterceptor *Instance() {
        return sInterceptor_ ? sInterceptor_ : CreateChecker();
    }

    /// Destroys the last link, so that the chain is empty.
    /// @throws InternalException when a decorator is still pushed; nothing is then destroyed
    static void Destroy();

    /// Makes a decorator the first link. It stays the caller's: pop it before it is destroyed.
    /// An InterceptorScope does both.
    void addInterceptor(WGLInterceptorDecorator *decorator);

    /// Takes the first link off the chain when it is a decorator.
    /// @return the decorator, or null when only the last link is left
    WGLInterceptorDecorator *popInterceptor();

protected:
    /// In no chain yet.
    WGLInterceptor() = default;
    WGLInterceptor(WGLInterceptor const &) = default;
    WGLInterceptor &operator=(WGLInterceptor const &) = default;
    ~WGLInterceptor() = default;

private:
    static WGLInterceptor *CreateChecker();

    static WGLInterceptor *sInterceptor_;
};

/// Base of WGL decorators: knows the next link. A concrete decorator implements every operation and
/// forwards it to `interceptor()`; derive from WGLForwarder to write only those of interest.
class ORU_API WGLInterceptorDecorator : public WGLInterceptor {
public:
    /// Makes a link that is in no chain yet.
    /// @param next the next link, not owned; pushing the decorator sets it anew
    explicit WGLInterceptorDecorator(WGLInterceptor *next = nullptr) : next_(next) {}
    virtual ~WGLInterceptorDecorator();

    /// The next link, null while the decorator is in no chain.
    WGLInterceptor *interceptor() { return next_; }
    WGLInterceptor const *interceptor() const { return next_; } ///< The next link.
    /// Called as the decorator is pushed.
    void setInterceptor(WGLInterceptor *next) { next_ = next; }

private:
    WGLInterceptor *next_;
};

/// The last link of the WGL chain: calls the platform's function and returns its result. It checks
/// nothing, whatever the name says, which hosts know: WGL reports failures by its results.
class ORU_API WGLErrorChecker : public WGLInterceptor {
public:
    /// The chain makes its own.
    WGLErrorChecker() = default;

#define ORU_WGL_OPERATION(Result, Name, Parameters, Arguments)                                     \
    Result wcgm##Name Parameters override;
#include "oru/oru_ogl/extensionator/wgl/wgloperations.inc"

    virtual ~WGLErrorChecker();

    // Reachable only on the checker itself, not through the chain.
#define ORU_WGL_OPERATION(Result, Name, Parameters, Arguments) virtual Result wcgm##Name Parameters;
#include "oru/oru_ogl/extensionator/wgl/wglcheckeroperations.inc"
};

} // namespace ORU::OGL
