// Picture files of kinds that the programs read but do not write.
#pragma once

#include <vector>

namespace apps_test {

using Bytes = std::vector<unsigned char>;

/// A PNG of 5 x 3 pixels with a palette of four colours, one of them half transparent when asked
/// for. Pixel (x, y) has colour (x + y) % 4, whose red is 60 × its number, green 255 − that,
/// blue 7.
Bytes PalettePng(bool transparent);

/// A grey PNG of 5 x 3 pixels of fewer than 8 bits: pixel (x, y) is (x + y) % levels.
Bytes LowDepthPng(int bits);

/// A PNG of 9 x 7 pixels in RGB, interlaced: pixel (x, y) is (20x, 30y, x + y).
Bytes InterlacedPng();

/// A grey PNG of 4 x 1 pixels, 0 to 3, of which the value 2 stands for transparent.
Bytes ColourKeyPng();

enum class JpegKind { Grey, YCbCr, Cmyk };

/// A smooth JPEG of 33 x 17 pixels.
Bytes Jpeg(JpegKind kind);

/// The same with Exif data in either byte order that tell the orientation.
Bytes JpegHeld(unsigned int orientation, bool bigEndian);

} // namespace apps_test
