// What JPEG files hold beside pixels, in their markers.
#pragma once

#include "apps/common/picture.h"
#include "apps/common/uprightreader.h"

#include <cstdio> // jpeglib.h needs it

#include <jpeglib.h>

#include <string>
#include <vector>

namespace App {

/// Has the library keep the markers that matter, before it reads the header.
void SaveJpegMarkers(j_decompress_ptr codec);

/// Takes them into the head of the upright picture.
/// @return how the picture is stored
Orientation TakeJpegMarkers(jpeg_decompress_struct const &codec, PictureHead &head);

/// A marker to be written.
struct JpegMarker {
    int marker;
    Bytes bytes;
};

/// The markers of a picture's file.
/// @param losses gets what there is no room for
std::vector<JpegMarker> JpegMarkersOf(PictureHead const &head, std::vector<std::string> &losses);

/// Has the library write a resolution, which it does in whole numbers.
void SetJpegDensity(j_compress_ptr codec, Resolution const &resolution);

} // namespace App
