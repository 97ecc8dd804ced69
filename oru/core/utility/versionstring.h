// Reading of OpenGL version texts.
#pragma once

#include "oru/core/utility/export.h"

#include <string>

namespace ORU {

/// Splits a version text "major.minor[.release][ vendor text]" (OpenGL 4.6 compatibility profile
/// specification, section 22.2).
/// Where a number cannot be read it is 0.
/// @param minor repeats `major` when the text has no full stop
/// @param release -1 when the text has no third number
/// @param vendor everything after the blank that ends the numbers
ORU_API void TokenizeVersionString(std::string const &version, unsigned &major, unsigned &minor,
                                   int &release, std::string &vendor);

} // namespace ORU
