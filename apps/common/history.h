// The history of a picture, as it goes from one file into another.
#pragma once

#include "apps/common/picture.h"
#include "apps/common/tiffstructure.h"
#include "apps/common/uprightreader.h"

#include <string>
#include <vector>

namespace App {

/// Takes what a file says of its picture into the head of the upright one: Exif data and XMP
/// without what is no longer true, and what they say of colour and resolution where the head knows
/// nothing. What is damaged is dropped, which the losses then tell.
/// @return how the picture is stored
Orientation TakeHistory(Bytes exif, Bytes xmp, PictureHead &head);

/// The history of a picture for its file: with its size and its colour space.
Metadata HistoryOf(PictureHead const &head);

/// Exif data of what a TIFF file tells of its picture; empty when that is nothing.
/// @param losses gets what may not be understood there
/// @throws Failure when it is damaged
Bytes ExifOfTiff(TiffStructure const &structure, std::vector<std::string> &losses);

/// What of Exif data has its place in a TIFF file: fields and directories.
/// @param isBigEndian whether the TIFF file is
/// @throws Failure when they are damaged
TiffTree TiffOfExif(Bytes const &exif, bool isBigEndian, std::vector<std::string> &losses);

} // namespace App
