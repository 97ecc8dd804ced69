// Which way up a photo is.
#include "apps/common/orientation.h"

#include <algorithm>
#include <cstring>

namespace App {

namespace {

/// Reads numbers of a TIFF structure in its byte order; 0 behind its end.
class TiffReader {
public:
    TiffReader(unsigned char const *data, std::size_t size)
        : data_(data), size_(size), bigEndian_(size > 0 && data[0] == 'M') {}

    unsigned int number(std::size_t offset, std::size_t bytes) const {
        if (offset > size_ || bytes > size_ - offset)
            return 0;
        unsigned int value = 0;
        for (std::size_t i = 0; i < bytes; ++i)
            value = value << 8 | data_[offset + (bigEndian_ ? i : bytes - 1 - i)];
        return value;
    }

private:
    unsigned char const *data_;
    std::size_t size_;
    bool bigEndian_;
};

} // namespace

Orientation ReadOrientation(unsigned char const *segment, std::size_t size) {
    constexpr std::size_t kPrefix = 6; // "Exif" and two zeros
    constexpr unsigned int kTag = 0x0112;
    constexpr std::size_t kEntryBytes = 12;
    if (size < kPrefix || std::memcmp(segment, "Exif\0", kPrefix) != 0)
        return kUpright;
    TiffReader const tiff(segment + kPrefix, size - kPrefix);
    std::size_t const directory = tiff.number(4, 4);
    std::size_t const entries = tiff.number(directory, 2);
    for (std::size_t i = 0; i < entries; ++i) {
        std::size_t const entry = directory + 2 + i * kEntryBytes;
        Orientation const orientation = tiff.number(entry + 8, 2);
        if (tiff.number(entry, 2) == kTag && orientation >= 1 && orientation <= 8)
            return orientation;
    }
    return kUpright;
}

Image Upright(Image const &image, Orientation orientation) {
    if (orientation == kUpright)
        return image;
    auto const isOneOf = [orientation](std::initializer_list<Orientation> set) {
        return std::find(set.begin(), set.end(), orientation) != set.end();
    };
    bool const turned = orientation >= 5; // rows are columns
    bool const flippedX = isOneOf({2, 3, 7, 8});
    bool const flippedY = isOneOf({3, 4, 6, 7});
    Shape shape = image;
    if (turned)
        std::swap(shape.width, shape.height);
    Image upright(shape);
    std::size_t const bytes = image.bytesPerPixel();
    for (std::size_t y = 0; y < shape.height; ++y)
        for (std::size_t x = 0; x < shape.width; ++x) {
            std::size_t const column = turned ? y : x;
            std::size_t const row = turned ? x : y;
            unsigned char const *const source =
                image.row(flippedY ? image.height - 1 - row : row) +
                (flippedX ? image.width - 1 - column : column) * bytes;
            std::copy_n(source, bytes, upright.row(y) + x * bytes);
        }
    return upright;
}

} // namespace App
