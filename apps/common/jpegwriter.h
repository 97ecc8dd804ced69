// Pictures in JPEG form, written row by row.
#pragma once

#include "apps/common/picturefile.h"
#include "apps/common/sink.h"

#include <memory>

namespace App {

/// Begins a JPEG.
/// @throws Failure when it cannot hold such a picture
std::unique_ptr<PictureWriter> CreateJpeg(std::unique_ptr<Sink> sink, PictureHead const &head,
                                          Encoding const &encoding);

} // namespace App
