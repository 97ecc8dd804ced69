// The parts of a picture that developing works on.
#include "apps/develop/areas.h"

#include "apps/develop/gaussian.h"

#include "oru/core/math/region_2d/boundingrect.h"

#include <cmath>

namespace Develop {

using ambra::lumo::TVec2;
using ORU::BoundingRect;
using ORU::IntegerRect;

namespace {

TVec2<float> Point(std::size_t x, std::size_t y) {
    return TVec2<float>(static_cast<float>(x), static_cast<float>(y));
}

/// The pixels of a picture that a region touches.
IntegerRect PixelsOf(ORU::BoundingRegion region, App::Shape const &picture) {
    region.intersect(BoundingRect(Point(0, 0), Point(picture.width, picture.height)));
    if (region.isEmpty())
        return IntegerRect();
    BoundingRect const bounds = region.boundingRect();
    TVec2<int> const first(static_cast<int>(std::floor(bounds.minimum().x)),
                           static_cast<int>(std::floor(bounds.minimum().y)));
    TVec2<int> const end(static_cast<int>(std::ceil(bounds.maximum().x)),
                         static_cast<int>(std::ceil(bounds.maximum().y)));
    return IntegerRect(first, ORU::size2(static_cast<std::size_t>(end.x - first.x),
                                         static_cast<std::size_t>(end.y - first.y)));
}

/// The pixels of a picture within `reach` pixels of some of them.
IntegerRect Widened(IntegerRect const &area, std::size_t reach, App::Shape const &picture) {
    auto const left = static_cast<std::size_t>(area.offset().x);
    auto const top = static_cast<std::size_t>(area.offset().y);
    ORU::BoundingRegion region(Point(left, top), Point(left + area.width(), top + area.height()));
    region.outset(Point(reach, reach));
    return PixelsOf(region, picture);
}

} // namespace

Areas WholePicture(App::Shape const &picture) {
    IntegerRect const frame(TVec2<int>(0, 0), ORU::size2(picture.width, picture.height));
    return {frame, frame};
}

Areas AreasOfSpots(std::vector<Spot> const &spots, Sharpening const &sharpening,
                   App::Shape const &picture) {
    IntegerRect const target = PixelsOf(RegionOf(spots), picture);
    if (target.isEmpty() || !sharpening.isOn())
        return {target, target};
    return {target, Widened(target, GaussianReach(sharpening.sigma), picture)};
}

} // namespace Develop
