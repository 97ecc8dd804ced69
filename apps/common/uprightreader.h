// Pictures that come upright, however they are stored.
#pragma once

#include "apps/common/picturefile.h"

#include <memory>

namespace App {

/// How a camera held a picture, by the numbers of the Exif tag Orientation (0x0112): 1 is upright,
/// 2 to 4 are mirrored or upside down, 5 to 8 lie on a side.
using Orientation = unsigned int;
constexpr Orientation kUpright = 1;

/// Whether rows of such a picture are stored as columns.
constexpr bool IsTurned(Orientation orientation) {
    return orientation >= 5;
}

/// The reader of the picture as it is to be looked at. Mirrored rows come as they are read; for all
/// else the first row needs the whole stored picture, which is put aside in a temporary file when
/// it is large.
std::unique_ptr<PictureReader> Upright(std::unique_ptr<PictureReader> stored,
                                       Orientation orientation);

} // namespace App
