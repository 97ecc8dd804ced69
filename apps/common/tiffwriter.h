// Pictures in TIFF form, written row by row.
#pragma once

#include "apps/common/picturefile.h"
#include "apps/common/sink.h"

#include <memory>

namespace App {

/// Begins a TIFF: strips compressed by deflate, BigTIFF when 4 GB may not do.
std::unique_ptr<PictureWriter> CreateTiff(std::unique_ptr<Sink> sink, PictureHead const &head);

} // namespace App
