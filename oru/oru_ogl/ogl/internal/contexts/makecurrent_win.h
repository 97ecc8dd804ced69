// Making a context current, or saying that it cannot be.
#pragma once

#include "oru/core/utility/windowsforward.h"

namespace ORU::OGL::internal {

/// Makes a rendering context current on the calling thread.
/// @param file, line position of the caller, which the call and the failure carry
/// @throws InternalException when the system refuses
void MakeCurrent(char const *file, unsigned int line, HDC dc, HGLRC context);

} // namespace ORU::OGL::internal
