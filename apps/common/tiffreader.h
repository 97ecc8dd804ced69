// Pictures in TIFF form, read row by row.
#pragma once

#include "apps/common/picturefile.h"
#include "apps/common/source.h"

#include <memory>

namespace App {

/// Whether a file begins as a TIFF does.
bool IsTiff(Bytes const &beginning);

/// Reads the first picture of a TIFF: grey or colours, of 8 or 16 bits or floats, in strips or
/// tiles.
/// @throws Failure when it is damaged, or of a kind that is not read
std::unique_ptr<PictureReader> OpenTiff(std::unique_ptr<Source> source);

} // namespace App
