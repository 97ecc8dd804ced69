// How a picture is cut into bands of rows and these into tiles.
#pragma once

#include "apps/common/image.h"

#include "oru/core/utility/integerrect.h"

#include <cstddef>
#include <vector>

namespace Develop {

/// Some rows of a picture that follow each other.
struct Rows {
    std::size_t first = 0;
    std::size_t end = 0; ///< behind the last

    std::size_t count() const { return end - first; }
};

/// What is developed at once.
struct Tile {
    ORU::IntegerRect target; ///< the pixels to compute, in the picture
    ORU::IntegerRect source; ///< the pixels that they depend on, these among them
};

/// Bands go from thread to thread and make up the memory that a picture needs; tiles go through the
/// GPU one after the other. Neither changes a pixel of the result.
class BandPlan {
public:
    /// What to stay below.
    struct Limits {
        std::size_t pixels = std::size_t{1} << 19; ///< of a tile, about
        std::size_t side = std::size_t{1} << 14;   ///< of a tile with what it depends on
        std::size_t bytes = std::size_t{16} << 20; ///< of a band, unless the blur needs more
    };

    /// @param reach how far a pixel depends on others to each side
    BandPlan(App::Shape const &picture, std::size_t reach, Limits const &limits);

    std::size_t bands() const;

    /// The rows that a band computes, and those that they depend on.
    Rows target(std::size_t band) const;
    Rows source(std::size_t band) const;

    /// Cuts the areas of a band that are to be computed into tiles.
    std::vector<Tile> tiles(std::vector<ORU::IntegerRect> const &areas) const;

    /// All pixels of a band.
    ORU::IntegerRect area(std::size_t band) const;

private:
    Tile tile(ORU::IntegerRect const &target) const;

    std::size_t width_;
    std::size_t height_;
    std::size_t reach_;
    std::size_t rows_;      ///< of a band
    std::size_t tileWidth_; ///< at most
};

/// A rectangle of a picture.
ORU::IntegerRect PixelRect(std::size_t left, std::size_t top, std::size_t width,
                           std::size_t height);

} // namespace Develop
