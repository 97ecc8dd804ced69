// What PNG files hold beside pixels, in their chunks.
#pragma once

#include "apps/common/picture.h"
#include "apps/common/source.h"
#include "apps/common/uprightreader.h"

#include <array>
#include <string>
#include <vector>

namespace App {

/// Takes what the chunks before and behind the pixels tell into the head of the upright picture.
/// @return how the picture is stored
Orientation TakePngChunks(Source &source, PictureHead &head);

/// A chunk to be written.
struct PngChunk {
    std::array<unsigned char, 5> name; ///< with a zero behind it
    Bytes bytes;
};

/// The chunks of a picture's file, which go before the pixels.
/// @param losses gets what PNG does not hold
std::vector<PngChunk> PngChunksOf(PictureHead const &head, std::vector<std::string> &losses);

} // namespace App
