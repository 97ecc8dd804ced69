// The platform's OpenGL and WGL headers, for sources that call it or need its constants: windows.h,
// gl.h, glext.h and wglext.h in an order that leaves the names of this library alone. The macros of
// these headers that spell a capability of OpenGLExtension (GL_VERSION_1_2 and so on, all of them
// 1) are undefined at the end. A source that includes glext.h itself after this includes
// openglextension_undef.inc behind it.
#pragma once

#ifndef WIN32_LEAN_AND_MEAN
#define WIN32_LEAN_AND_MEAN
#endif
#ifndef NOMINMAX
#define NOMINMAX
#endif
#include <windows.h>

#include <GL/gl.h>

#include <GL/glext.h>
#include <GL/wglext.h>

#include "oru/oru_ogl/openglextension_undef.inc"
