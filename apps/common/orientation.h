// Which way up a photo is.
#pragma once

#include "apps/common/image.h"

#include <cstddef>

namespace App {

/// How a camera held a picture, by the numbers of the Exif tag Orientation (0x0112): 1 is upright,
/// 2 to 4 are mirrored or upside down, 5 to 8 lie on a side.
using Orientation = unsigned int;
constexpr Orientation kUpright = 1;

/// Reads the orientation from a JPEG's Exif segment (APP1, from "Exif" on).
/// @return upright when the segment is of another kind, damaged or does not say
Orientation ReadOrientation(unsigned char const *segment, std::size_t size);

/// The picture as it is to be looked at.
Image Upright(Image const &image, Orientation orientation);

} // namespace App
