// Pictures in PNG form, read row by row.
#pragma once

#include "apps/common/picturefile.h"
#include "apps/common/source.h"

#include <memory>

namespace App {

/// Whether a file begins as a PNG does.
bool IsPng(Bytes const &beginning);

/// Reads a PNG: fewer than 8 bits become 8, palettes and colour keys become what they stand for.
/// @throws Failure when it is damaged or has no pixels
std::unique_ptr<PictureReader> OpenPng(std::unique_ptr<Source> source);

} // namespace App
