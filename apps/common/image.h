// A picture in memory.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace App {

/// Size and kind of a picture: one to four channels (grey; grey and alpha; red, green, blue; these
/// and alpha), each an unsigned integer of 8 or 16 bits or a float of 32.
struct Shape {
    std::size_t width = 0;
    std::size_t height = 0;
    unsigned int channels = 0;
    unsigned int bitsPerChannel = 8;

    bool hasAlpha() const { return channels == 2 || channels == 4; }
    std::size_t bytesPerPixel() const { return std::size_t{channels} * bitsPerChannel / 8; }
    std::size_t rowBytes() const { return width * bytesPerPixel(); }

    /// Such as "451 x 300, RGB, 8 bit".
    std::string description() const;
};

bool operator==(Shape const &a, Shape const &b);
inline bool operator!=(Shape const &a, Shape const &b) {
    return !(a == b);
}

/// Pixels in rows from top to bottom, without gaps; channels in the machine's byte order.
struct Image : Shape {
    std::vector<unsigned char> pixels;

    Image() = default;

    /// A picture of zeros.
    explicit Image(Shape const &shape) : Shape(shape), pixels(rowBytes() * height) {}

    unsigned char *row(std::size_t y) { return pixels.data() + y * rowBytes(); }
    unsigned char const *row(std::size_t y) const { return pixels.data() + y * rowBytes(); }
};

/// @throws Failure when a picture has no pixels
void RequirePixels(std::size_t width, std::size_t height);

/// The largest side, in pixels, of a picture that the GPU takes.
struct SizeLimit {
    std::size_t side = static_cast<std::size_t>(-1);

    /// @throws Failure when a picture does not fit
    void require(std::size_t width, std::size_t height) const;
};

} // namespace App
