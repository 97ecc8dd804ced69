// A picture in memory to draw the guide's pictures on, and its PNG files.
#pragma once

#include "oru/core/math/region_2d/boundingrect.h"

#include <array>
#include <cstdint>
#include <string>
#include <vector>

namespace guide {

using Colour = std::array<std::uint8_t, 3>;
using Point = ambra::lumo::TVec2<float>;

/// Where pixel (x, y) lies in a row-by-row array.
inline std::size_t Index(int x, int y, int width) {
    return static_cast<std::size_t>(y) * static_cast<std::size_t>(width) +
           static_cast<std::size_t>(x);
}

/// The centre of pixel (x, y).
inline Point PixelCentre(int x, int y) {
    return Point(static_cast<float>(x) + 0.5f, static_cast<float>(y) + 0.5f);
}

/// An 8-bit RGB picture.
class Canvas {
public:
    Canvas(int width, int height, Colour const &colour);

    /// @throws std::runtime_error when the file is no readable picture of this kind
    static Canvas Read(std::string const &path);

    /// @throws std::runtime_error when the file cannot be written
    void write(std::string const &path) const;

    int width() const { return width_; }
    int height() const { return height_; }
    Colour &at(int x, int y) { return pixels_[Index(x, y, width_)]; }
    Colour const &at(int x, int y) const { return pixels_[Index(x, y, width_)]; }

    /// The part of `width` x `height` pixels whose top left is (x, y).
    Canvas part(int x, int y, int width, int height) const;

    void paste(Canvas const &source, int x, int y);

    /// Mixes `colour` in by `share` (0 to 1) where a pixel's centre is inside `region`.
    void fill(ORU::BoundingRegionBase const &region, Colour const &colour, float share);

    /// Draws the border of `rect`, `thickness` pixels wide, to its inside.
    void outline(ORU::BoundingRect const &rect, Colour const &colour, int thickness);

    friend bool operator==(Canvas const &a, Canvas const &b) {
        return a.width_ == b.width_ && a.pixels_ == b.pixels_;
    }

private:
    int width_;
    int height_;
    std::vector<Colour> pixels_;
};

/// `colour` mixed into `pixel` by `share` (0 to 1).
Colour Mixed(Colour const &pixel, Colour const &colour, float share);

} // namespace guide
