// Pictures in files that tests make, with a history.
#pragma once

#include "apps/common/picturefile.h"
#include "tests/support/pictures.h"
#include "tests/support/program.h"

#include <algorithm>
#include <string>

namespace apps_test {

inline App::PictureHead HeadOf(App::FileKind kind, App::Shape const &shape) {
    App::PictureHead head;
    static_cast<App::Shape &>(head) = shape;
    head.kind = kind;
    return head;
}

/// The bytes of a file of the kind that the head says.
/// @param losses gets what it does not hold
inline Bytes Encoded(App::PictureHead const &head, Bytes const &pixels,
                     std::vector<std::string> *losses = nullptr) {
    Bytes file;
    App::Encoding encoding;
    encoding.kind = head.kind;
    encoding.quality = 100;
    encoding.sampling = {1, 1};
    auto const writer = App::CreatePicture(std::make_unique<App::MemorySink>(file), head, encoding);
    writer->write(pixels.data(), head.height);
    writer->finish();
    if (losses)
        *losses = writer->losses();
    return file;
}

inline std::unique_ptr<App::PictureReader> Opened(Bytes const &file) {
    return App::OpenPicture(std::make_unique<App::MemorySource>(file));
}

/// Exif data of a camera: its make, how it was held, a size, a colour space, a thumbnail.
inline Bytes ExifOf(unsigned char orientation) {
    return {'I', 'I', 42, 0, 8, 0, 0, 0,
            // the first directory
            3, 0, 0x0F, 1, 2, 0, 4, 0, 0, 0, 'O', 'R', 'U', 0,      // make
            0x12, 1, 3, 0, 1, 0, 0, 0, orientation, 0, 0, 0,        // orientation
            0x69, 0x87, 4, 0, 1, 0, 0, 0, 50, 0, 0, 0, 92, 0, 0, 0, // the camera's, then the next
            // the camera's
            3, 0, 1, 0xA0, 3, 0, 1, 0, 0, 0, 1, 0, 0, 0,        // sRGB
            2, 0xA0, 3, 0, 1, 0, 0, 0, 99, 0, 0, 0,             // width
            3, 0xA0, 4, 0, 1, 0, 0, 0, 99, 0, 0, 0, 0, 0, 0, 0, // height
            // the thumbnail's
            2, 0, 1, 2, 4, 0, 1, 0, 0, 0, 122, 0, 0, 0,     // where
            2, 2, 4, 0, 1, 0, 0, 0, 4, 0, 0, 0, 0, 0, 0, 0, // how long
            'T', 'H', 'U', 'M'};
}

/// Gives a picture all that a file can tell of it, of which the size and the orientation are not
/// true.
inline void GiveHistory(App::PictureHead &head, std::size_t profileBytes) {
    std::string const xmp = "<x tiff:Orientation=\"6\"><exif:PixelXDimension>99</exif:"
                            "PixelXDimension></x>";
    head.metadata.exif = ExifOf(1);
    head.metadata.xmp.assign(xmp.begin(), xmp.end());
    head.metadata.iptc = {0x1C, 2, 25, 0, 3, 'O', 'R', 'U'};
    head.metadata.resolution = App::Resolution{300, 300, App::Resolution::Unit::Inch};
    head.colour.isNamedSrgb = true;
    head.colour.profile.resize(profileBytes);
    for (std::size_t i = 0; i < head.colour.profile.size(); ++i)
        head.colour.profile[i] = static_cast<unsigned char>(i * i >> 8);
}

/// Changes the first value of a field of a TIFF that this system wrote.
inline void SetShort(Bytes &tiff, unsigned int tag, unsigned int value) {
    Bytes const entry = {static_cast<unsigned char>(tag), static_cast<unsigned char>(tag >> 8)};
    auto const directory = tiff.begin() + (tiff[4] | tiff[5] << 8 | tiff[6] << 16);
    for (auto field = directory + 2; field < tiff.end(); field += 12)
        if (std::equal(entry.begin(), entry.end(), field)) {
            field[8] = static_cast<unsigned char>(value);
            field[9] = static_cast<unsigned char>(value >> 8);
            return;
        }
}

} // namespace apps_test
