// The OpenGL types of the Khronos registry, without the platform's gl.h and the windows.h it needs.
#pragma once

// Each type repeats the registry's definition for 64-bit Windows, so that gl.h and glext.h may be
// included before or after this header, or not at all.

/// @name Types of OpenGL
/// As the Khronos registry defines them for 64-bit Windows.
/// @{
typedef unsigned int GLenum;
typedef unsigned char GLboolean;
typedef unsigned int GLbitfield;
typedef void GLvoid;
typedef signed char GLbyte;
typedef short GLshort;
typedef int GLint;
typedef unsigned char GLubyte;
typedef unsigned short GLushort;
typedef unsigned int GLuint;
typedef int GLsizei;
typedef float GLfloat;
typedef float GLclampf;
typedef double GLdouble;
typedef double GLclampd;
typedef char GLchar;
typedef char GLcharARB;
typedef unsigned short GLhalfNV;
typedef unsigned int GLhandleARB;
typedef signed long long int GLsizeiptr;
typedef signed long long int GLintptr;
typedef signed long long int GLsizeiptrARB;
typedef signed long long int GLintptrARB;
typedef signed long long int GLint64;
typedef unsigned long long int GLuint64;
typedef struct __GLsync *GLsync;
/// @}

/// The calling convention of OpenGL and WGL functions.
#if defined(_WIN32)
#define ORU_APIENTRY __stdcall
#else
#define ORU_APIENTRY
#endif
