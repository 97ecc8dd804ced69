// The parts of a picture that spots can change.
#include "apps/develop/spotareas.h"

#include "apps/develop/bandplan.h"

#include <algorithm>
#include <cmath>

namespace Develop {

using ambra::lumo::TVec2;
using ORU::BoundingRect;
using ORU::IntegerRect;

namespace {

TVec2<float> Point(std::size_t x, std::size_t y) {
    return TVec2<float>(static_cast<float>(x), static_cast<float>(y));
}

BoundingRect RectOf(IntegerRect const &area) {
    auto const left = static_cast<std::size_t>(area.offset().x);
    auto const top = static_cast<std::size_t>(area.offset().y);
    return BoundingRect(Point(left, top), Point(left + area.width(), top + area.height()));
}

/// The pixels that a rectangle touches.
IntegerRect PixelsOf(BoundingRect const &rect) {
    auto const left = static_cast<std::size_t>(std::floor(rect.minimum().x));
    auto const top = static_cast<std::size_t>(std::floor(rect.minimum().y));
    return PixelRect(left, top, static_cast<std::size_t>(std::ceil(rect.maximum().x)) - left,
                     static_cast<std::size_t>(std::ceil(rect.maximum().y)) - top);
}

} // namespace

SpotAreas::SpotAreas(std::vector<Spot> const &spots, App::Shape const &picture, std::size_t reach)
    : reach_(reach) {
    BoundingRect const frame(Point(0, 0), Point(picture.width, picture.height));
    for (Spot const &spot : spots) {
        BoundingRect region = RegionOf(spot);
        region.intersect(frame);
        if (region.area() > 0)
            regions_.push_back(region);
    }
    std::sort(regions_.begin(), regions_.end(), [](BoundingRect const &a, BoundingRect const &b) {
        return a.minimum().x < b.minimum().x;
    });
}

std::vector<IntegerRect> SpotAreas::in(IntegerRect const &band) const {
    BoundingRect const rows = RectOf(band);
    float const near = 2 * static_cast<float>(reach_) + 1;
    std::vector<BoundingRect> merged;
    for (BoundingRect region : regions_) { // from left to right
        region.intersect(rows);
        if (region.area() <= 0)
            continue;
        if (!merged.empty() && region.minimum().x <= merged.back().maximum().x + near)
            merged.back().include(region);
        else
            merged.push_back(region);
    }
    std::vector<IntegerRect> areas;
    areas.reserve(merged.size());
    for (BoundingRect const &rect : merged)
        areas.push_back(PixelsOf(rect));
    return areas;
}

} // namespace Develop
