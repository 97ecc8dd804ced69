// The chain through which the library makes its OpenGL calls.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/oru_ogl/gltypes.h"

namespace ORU::OGL {

class OpenGLInterceptorDecorator;

/// A link of the chain: one operation `cgm<Name>` per wrapped entry point `gl<Name>`.
///
/// The last link is always an OpenGLErrorChecker, which makes the real call and turns a GL error
/// into an ExceptionOGL that names the caller's file and line; decorators that the host pushed run
/// before it. Each operation takes the caller's file and line in front of the GL arguments and
/// returns what the GL function returns:
///
/// ```cpp
/// OpenGLInterceptor::Instance()->cgmBindTexture(__FILE__, __LINE__, GL_TEXTURE_2D, name);
/// ```
///
/// The chain is process-wide and not locked: change it while no thread makes GL calls.
class ORU_API OpenGLInterceptor {
public:
#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    virtual Result cgm##Name Parameters = 0;
#include "oru/oru_ogl/extensionator/gloperations.inc"

    virtual ~OpenGLInterceptor();

    /// The first link of the chain; the first call makes the error checker.
    static OpenGLInterceptor *Instance() {
        return sInterceptor_ ? sInterceptor_ : CreateErrorChecker();
    }

    /// Destroys the error checker, so that the chain is empty.
    /// @throws InternalException when a decorator is still pushed; nothing is then destroyed
    static void Destroy();

    /// Makes a decorator the first link. It stays the caller's: pop it before it is destroyed.
    /// An InterceptorScope does both.
    void addInterceptor(OpenGLInterceptorDecorator *decorator);

    /// Takes the first link off the chain when it is a decorator.
    /// @return the decorator, or null when only the error checker is left
    OpenGLInterceptorDecorator *popInterceptor();

protected:
    /// In no chain yet.
    OpenGLInterceptor() = default;
    OpenGLInterceptor(OpenGLInterceptor const &) = default;
    OpenGLInterceptor &operator=(OpenGLInterceptor const &) = default;

private:
    static OpenGLInterceptor *CreateErrorChecker();

    static OpenGLInterceptor *sInterceptor_;
};

} // namespace ORU::OGL
