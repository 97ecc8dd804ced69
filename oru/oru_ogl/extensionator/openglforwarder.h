// A decorator that only forwards, to derive from.
#pragma once

#include "oru/oru_ogl/extensionator/openglinterceptordecorator.h"

namespace ORU::OGL {

/// Forwards every operation to the next link. Override the operations of interest and call
/// `OpenGLForwarder::cgm<Name>` from them to go on along the chain.
class OpenGLForwarder : public OpenGLInterceptorDecorator {
public:
    using OpenGLInterceptorDecorator::OpenGLInterceptorDecorator;

#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    Result cgm##Name Parameters override {                                                         \
        return interceptor()->cgm##Name Arguments;                                                 \
    }
#include "oru/oru_ogl/extensionator/gloperations.inc"
};

} // namespace ORU::OGL
