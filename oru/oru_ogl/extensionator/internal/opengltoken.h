// The table behind ORUOGLTokenName, whose rows know their length.
#pragma once

#include "oru/oru_ogl/gltypes.h"

#include <cstdint>

namespace ORU::OGL::internal {

/// A named OpenGL value.
struct OpenGLToken {
    GLenum value;
    std::uint32_t length; ///< of the name, without its zero
    char const *name;
};

/// The row of a value, or one with the name "Unknown Token".
OpenGLToken const &FindOpenGLToken(GLenum value);

} // namespace ORU::OGL::internal
