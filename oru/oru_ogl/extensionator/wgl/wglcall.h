// The short form of WGL calls through their interceptor chain.
#pragma once

#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"

/// `ORU_WGL(MakeCurrent, dc, rc)` calls wglMakeCurrent through the chain with this source position.
#define ORU_WGL(Name, ...)                                                                         \
    ::ORU::OGL::WGLInterceptor::Instance()->wcgm##Name(__FILE__, __LINE__, __VA_ARGS__)

/// `ORU_WGL0(GetCurrentContext)`: the same for the functions without arguments.
#define ORU_WGL0(Name) ::ORU::OGL::WGLInterceptor::Instance()->wcgm##Name(__FILE__, __LINE__)
