// Pictures in JPEG form, read row by row.
#pragma once

#include "apps/common/picturefile.h"
#include "apps/common/source.h"

#include <memory>

namespace App {

/// Whether a file begins as a JPEG does.
bool IsJpeg(Bytes const &beginning);

/// Reads a JPEG as grey or red, green and blue of 8 bits.
/// @throws Failure when it is damaged, or of a kind that is not read
std::unique_ptr<PictureReader> OpenJpeg(std::unique_ptr<Source> source);

} // namespace App
