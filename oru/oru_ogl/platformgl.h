// The platform's OpenGL and WGL headers, for sources that call it or need its constants: windows.h,
// gl.h, glext.h and wglext.h in an order that leaves the names of this library alone. The macros of
// these headers that spell a capability of OpenGLExtension (GL_VERSION_1_2 and so on, all of them
// 1) are undefined at the end. A source that includes glext.h itself after this includes
// openglextension_undef.inc behind it.
#pragma once

// A small windows.h without min and max; what a host did not ask for itself is not left behind.
#ifndef WIN32_LEAN_AND_MEAN
#define WIN32_LEAN_AND_MEAN
#define ORU_PLATFORMGL_LEAN
#endif
#ifndef NOMINMAX
#define NOMINMAX
#define ORU_PLATFORMGL_NOMINMAX
#endif
#include <windows.h>
#ifdef ORU_PLATFORMGL_LEAN
#undef ORU_PLATFORMGL_LEAN
#undef WIN32_LEAN_AND_MEAN
#endif
#ifdef ORU_PLATFORMGL_NOMINMAX
#undef ORU_PLATFORMGL_NOMINMAX
#undef NOMINMAX
#endif

#include <GL/gl.h>

#include <GL/glext.h>
#include <GL/wglext.h>

#include "oru/oru_ogl/openglextension_undef.inc"
