// What a picture file says beside its pixels.
#pragma once

#include "apps/common/image.h"

#include <array>
#include <optional>
#include <string>
#include <vector>

namespace App {

using Bytes = std::vector<unsigned char>;

/// Chromaticities (CIE 1931 x, y) of white, red, green and blue.
using Primaries = std::array<std::array<double, 2>, 4>;

/// What the numbers of a picture mean, as its file tells it. What says more comes first: a profile,
/// then sRGB by name, then gamma and primaries; nothing at all stands for sRGB, and in a picture of
/// floats for linear light of its primaries.
struct ColourTags {
    Bytes profile;                      ///< ICC profile, or empty
    bool isNamedSrgb = false;           ///< PNG's sRGB, Exif's ColorSpace 1
    std::optional<double> gamma;        ///< a code is light to the power of 1 / gamma
    std::optional<Primaries> primaries; ///< without: those of sRGB
};

/// Pixels a unit of length, as the file has them.
struct Resolution {
    enum class Unit { None, Inch, Centimetre };
    double x = 0;
    double y = 0;
    Unit unit = Unit::None;
};

/// The history of a picture, carried from file to file.
struct Metadata {
    Bytes exif; ///< a TIFF structure, without "Exif" before it, orientation 1, no thumbnail
    Bytes xmp;  ///< XML in UTF-8
    Bytes iptc; ///< IIM records
    std::optional<Resolution> resolution;
    std::vector<std::string> losses; ///< what could not be read of it, for people
};

/// How JPEG stores colours: horizontal and vertical samples of luma for each of chroma's.
struct Sampling {
    int horizontal = 2;
    int vertical = 2;
};

enum class FileKind { Png, Jpeg, Tiff };

/// All of a picture but its pixels. Its size is that of the upright picture.
struct PictureHead : Shape {
    FileKind kind = FileKind::Png;
    ColourTags colour;
    Metadata metadata;
    std::optional<Sampling> sampling; ///< of a JPEG with colours
};

} // namespace App
