// Reading of OpenGL version texts.
#pragma once

#include "oru/core/utility/export.h"

#include <string>

namespace ORU {

/// Splits a version text "major.minor[.release][ vendor text]" (OpenGL 4.6 compatibility profile
/// specification, section 22.2).
/// @param release -1 when the text has no third number
/// @param vendor everything after the blank that ends the numbers
ORU_API void TokenizeVersionString(std::string const &version, unsigned &major, unsigned &minor,
                                   int &release, std::string &vendor);

} // namespace ORU
