// The platform's OpenGL and WGL headers, for sources that call it or need its constants.
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
