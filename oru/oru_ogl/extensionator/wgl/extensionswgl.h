// The WGL extension entry points, as process-wide pointers.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/core/utility/windowsforward.h"
#include "oru/oru_ogl/extensionator/openglextension.h"
#include "oru/oru_ogl/gltypes.h"

namespace ORU::OGL {

// Each pointer is null until a capability record that has its extension was built, and holds the
// address that the latest such record found. They are written without a lock, always with what the
// writing thread's context answers.
#define ORU_WGL_POINTER(Result, Pointer, Parameters)                                               \
    extern ORU_API Result(ORU_APIENTRY *Pointer) Parameters;
#include "oru/oru_ogl/extensionator/wgl/extensionswgl_pointers.inc"

/// Loads the entry points of a WGL extension from the current context.
/// @return whether it is a WGL extension and all of its entry points were found (of some it has
///         none); those found are stored in any case
/// @note wglGetProcAddress through the WGL chain
ORU_API bool InitializeWGLExtension(OpenGLExtension extension);

} // namespace ORU::OGL
