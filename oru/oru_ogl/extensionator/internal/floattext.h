// The usual text of a floating-point number, quickly.
#pragma once

#include <cstddef>

namespace ORU::OGL::internal {

/// Room that WriteNumber needs.
std::size_t const kNumberRoom = 16;

/// Writes a finite number as a stream with its first flags, precision and locale does, which is the
/// form %g of printf: six digits, correctly rounded, without trailing zeros.
/// @param out room for kNumberRoom characters; no zero byte is appended
/// @return the end of the text
char *WriteNumber(char *out, double value);

} // namespace ORU::OGL::internal
