// How a picture is cut into bands of rows and these into tiles.
#include "apps/develop/bandplan.h"

#include <algorithm>

namespace Develop {

using ORU::IntegerRect;

namespace {

/// Rows of a band: as many as a tile as wide as the picture has, but at least four times the reach,
/// for the rows that a band reads beside its own are worked on twice; fewer again when rows are so
/// long that their memory counts.
std::size_t BandRows(App::Shape const &picture, std::size_t reach, BandPlan::Limits const &limits) {
    std::size_t const affordable = limits.bytes / picture.rowBytes();
    std::size_t const most = std::max(reach / 2, affordable - std::min(affordable, 2 * reach));
    std::size_t const rows = std::max(limits.pixels / picture.width, std::min(4 * reach, most));
    std::size_t const fitting = limits.side > 2 * reach ? limits.side - 2 * reach : 1;
    return std::clamp<std::size_t>(rows, 1, std::min(picture.height, fitting));
}

/// A tile may be wider than its share by half, counted with the rows that it reads.
std::size_t TileWidth(std::size_t rows, std::size_t reach, BandPlan::Limits const &limits) {
    std::size_t const share = limits.pixels * 3 / 2 / (rows + 2 * reach);
    std::size_t const fitting = limits.side > 2 * reach ? limits.side - 2 * reach : 1;
    return std::max<std::size_t>(1, std::min(std::max(share, 2 * reach), fitting));
}

/// The part of an interval of a picture that is within `reach` of another, and its size.
struct Interval {
    std::size_t first, size;
};
Interval Widened(std::size_t first, std::size_t size, std::size_t reach, std::size_t limit) {
    std::size_t const begin = first - std::min(first, reach);
    return {begin, std::min(first + size + reach, limit) - begin};
}

} // namespace

IntegerRect PixelRect(std::size_t left, std::size_t top, std::size_t width, std::size_t height) {
    return IntegerRect(ambra::lumo::TVec2<int>(static_cast<int>(left), static_cast<int>(top)),
                       ORU::size2(width, height));
}

BandPlan::BandPlan(App::Shape const &picture, std::size_t reach, Limits const &limits)
    : width_(picture.width), height_(picture.height), reach_(reach),
      rows_(BandRows(picture, reach, limits)), tileWidth_(TileWidth(rows_, reach, limits)) {}

std::size_t BandPlan::bands() const {
    return (height_ + rows_ - 1) / rows_;
}

Rows BandPlan::target(std::size_t band) const {
    return {band * rows_, std::min(height_, (band + 1) * rows_)};
}

Rows BandPlan::source(std::size_t band) const {
    Rows const rows = target(band);
    Interval const wide = Widened(rows.first, rows.count(), reach_, height_);
    return {wide.first, wide.first + wide.size};
}

IntegerRect BandPlan::area(std::size_t band) const {
    Rows const rows = target(band);
    return PixelRect(0, rows.first, width_, rows.count());
}

Tile BandPlan::tile(IntegerRect const &target) const {
    Interval const across =
        Widened(static_cast<std::size_t>(target.offset().x), target.width(), reach_, width_);
    Interval const down =
        Widened(static_cast<std::size_t>(target.offset().y), target.height(), reach_, height_);
    return {target, PixelRect(across.first, down.first, across.size, down.size)};
}

std::vector<Tile> BandPlan::tiles(std::vector<IntegerRect> const &areas) const {
    std::vector<Tile> tiles;
    for (IntegerRect const &area : areas) {
        auto const left = static_cast<std::size_t>(area.offset().x);
        auto const top = static_cast<std::size_t>(area.offset().y);
        std::size_t const count = (area.width() + tileWidth_ - 1) / tileWidth_;
        for (std::size_t i = 0; i < count; ++i) {
            std::size_t const begin = area.width() * i / count;
            std::size_t const end = area.width() * (i + 1) / count;
            tiles.push_back(tile(PixelRect(left + begin, top, end - begin, area.height())));
        }
    }
    return tiles;
}

} // namespace Develop
