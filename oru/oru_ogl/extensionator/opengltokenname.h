// Names of OpenGL values, as the tracer writes them.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/oru_ogl/gltypes.h"

extern "C" {

/// The name of the OpenGL constant with a value, "Unknown Token" when none is known.
///
/// Known are the constants of OpenGL up to 4.1 and of the extensions in OpenGLExtension, but for
/// those that only GL_ARB_fragment_program has; where several share a value one of them is given, a
/// core name if there is one. The text is static.
ORU_API char const *ORUOGLTokenName(GLenum value);

/// "GL_FALSE" for 0, "GL_TRUE" for every other value. The text is static.
ORU_API char const *ORUOGLBoolToString(GLboolean value);

} // extern "C"
