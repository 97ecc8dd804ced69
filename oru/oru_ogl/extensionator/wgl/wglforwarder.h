// A WGL decorator that only forwards, to derive from.
#pragma once

#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"

namespace ORU::OGL {

/// Forwards every operation to the next link. Override the operations of interest and call
/// `WGLForwarder::wcgm<Name>` from them to go on along the chain.
class WGLForwarder : public WGLInterceptorDecorator {
public:
    using WGLInterceptorDecorator::WGLInterceptorDecorator;

#define ORU_WGL_OPERATION(Result, Name, Parameters, Arguments)                                     \
    Result wcgm##Name Parameters override {                                                        \
        return interceptor()->wcgm##Name Arguments;                                                \
    }
#include "oru/oru_ogl/extensionator/wgl/wgloperations.inc"
};

} // namespace ORU::OGL
