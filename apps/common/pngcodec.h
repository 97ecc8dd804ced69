// Pictures in PNG form.
#pragma once

#include "apps/common/image.h"

#include <cstddef>
#include <vector>

namespace App {

/// Bytes that tell a PNG, which is more than a JPEG needs.
constexpr std::size_t kPngSignatureBytes = 8;

/// Whether the bytes begin as a PNG does.
bool IsPng(std::vector<unsigned char> const &bytes);

/// Decodes a PNG: fewer than 8 bits become 8, palettes and colour keys become what they stand for.
/// @throws Failure when it is damaged, empty or larger than the limit
Image DecodePng(std::vector<unsigned char> const &bytes, SizeLimit limit);

/// @throws Failure when memory is exhausted
std::vector<unsigned char> EncodePng(Image const &image);

} // namespace App
