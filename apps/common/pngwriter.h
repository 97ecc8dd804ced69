// Pictures in PNG form, written row by row.
#pragma once

#include "apps/common/picturefile.h"
#include "apps/common/sink.h"

#include <memory>

namespace App {

/// Begins a PNG.
/// @throws Failure when it cannot hold such a picture
std::unique_ptr<PictureWriter> CreatePng(std::unique_ptr<Sink> sink, PictureHead const &head);

} // namespace App
