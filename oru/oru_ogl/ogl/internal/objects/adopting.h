// Making objects over GL names of other code.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"

namespace ORU::OGL::internal {

/// @param isOne what OpenGL says of the name (glIsTexture, say); names that were generated and
///        never bound are none yet
/// @param kind for the message
/// @throws InternalException unless it is one
inline void RequireName(bool isOne, unsigned int name, char const *kind) {
    if (!isOne)
        ORU_THROW_INTERNAL("The name ", name, " is no ", kind, " of the current context");
}

} // namespace ORU::OGL::internal
