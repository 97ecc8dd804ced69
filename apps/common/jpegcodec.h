// Pictures in JPEG form.
#pragma once

#include "apps/common/image.h"

#include <vector>

namespace App {

/// Whether the bytes begin as a JPEG does.
bool IsJpeg(std::vector<unsigned char> const &bytes);

/// Decodes a JPEG to grey or red, green and blue of 8 bits, turned as its Exif data ask for.
/// @throws Failure when it is damaged, cut off, larger than the limit, or in CMYK
Image DecodeJpeg(std::vector<unsigned char> const &bytes, SizeLimit limit);

} // namespace App
