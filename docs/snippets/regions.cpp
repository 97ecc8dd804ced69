// The code of the chapter on regions.
#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/math/region_2d/boundingregion.h"
#include "oru/core/utility/integerrect.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <vector>

using ORU::BoundingRect;
using ORU::BoundingRegion;
using ORU::IntegerRect;
using ORU::size2;

namespace {

// [point]
using Point = ambra::lumo::TVec2<float>;
// [point]

// [strokes]
struct Stroke {
    Point centre;
    float radius;
};

/// What a brush can have changed.
BoundingRegion Changed(std::vector<Stroke> const &strokes) {
    BoundingRegion changed; // nowhere
    for (Stroke const &stroke : strokes) {
        BoundingRect dab(stroke.centre, stroke.centre);
        dab.outset(Point(stroke.radius, stroke.radius));
        changed.include(dab);
    }
    return changed;
}
// [strokes]

// [pixels]
/// The pixels of a picture that a region touches; pixel (x, y) covers x to x + 1 and y to y + 1.
IntegerRect PixelsOf(BoundingRect bounds, size2 const &picture) {
    Point const end(static_cast<float>(picture[0]), static_cast<float>(picture[1]));
    bounds.intersect(BoundingRect(Point(0, 0), end)); // now there is no infinity left
    if (bounds.isEmpty())
        return IntegerRect();
    float const left = std::floor(bounds.minimum().x);
    float const top = std::floor(bounds.minimum().y);
    auto const width = static_cast<std::size_t>(std::ceil(bounds.maximum().x) - left);
    auto const height = static_cast<std::size_t>(std::ceil(bounds.maximum().y) - top);
    return IntegerRect({static_cast<int>(left), static_cast<int>(top)}, size2(width, height));
}
// [pixels]

TEST(RegionsGuide, StrokesAndPixels) {
    EXPECT_TRUE(Changed({}).isEmpty());
    size2 const picture(640, 480);
    // [growing]
    BoundingRegion changed = Changed({{Point(600, 100), 20}, {Point(610, 130), 10.5f}});
    // 580, 80   620.5, 140.5

    // A blur of radius 24 carries a change up to 24 pixels in each direction.
    changed.outset(Point(24, 24));
    // 556, 56   644.5, 164.5

    // A shadow lies 5 to 9 pixels to the right of its object and 3 to 7 below, or is the object.
    BoundingRect shadow(Point(5, 3), Point(9, 7));
    shadow.include(Point(0, 0));
    changed.dilate(shadow);
    // 556, 56   653.5, 171.5

    IntegerRect const compute = PixelsOf(changed.boundingRect(), picture);
    // [o=(556 56), s=(84, 116)]
    // [growing]
    EXPECT_EQ(changed.toString(), "556, 56   653.5, 171.5   ");
    EXPECT_EQ(compute.toString(), "[o=(556 56), s=(84, 116)]");
}

TEST(RegionsGuide, Reading) {
    size2 const picture(640, 480);
    BoundingRect const compute(Point(556, 56), Point(640, 172));
    // [reading]
    // To compute a pixel, the blur reads 24 pixels around it.
    BoundingRect toRead = compute;
    toRead.outset(Point(24, 24));
    IntegerRect const upload = PixelsOf(toRead, picture);
    // [o=(532 32), s=(108, 164)]

    // Of an upload of that size alone, this is what the blur computes from known pixels only.
    BoundingRect trusted(Point(532, 32), Point(640, 196));
    trusted.inset(Point(24, 24));
    // 556, 56   616, 172
    // [reading]
    EXPECT_EQ(upload.toString(), "[o=(532 32), s=(108, 164)]");
    EXPECT_EQ(trusted.toString(), "556, 56   616, 172   ");
    // [mirrored]
    // A motion blur that spreads up to 30 pixels to the right reads up to 30 from the left.
    BoundingRect const spreads(Point(0, 0), Point(30, 0));
    BoundingRect const reads(Point(-30, 0), Point(0, 0));
    // [mirrored]
    BoundingRect changed(Point(5, 5), Point(6, 6));
    changed.dilate(spreads);
    EXPECT_EQ(changed.toString(), "5, 5   36, 6   ");
    changed.dilate(reads);
    EXPECT_EQ(changed.toString(), "-25, 5   36, 6   ");
}

TEST(RegionsGuide, Bands) {
    int bands = 0;
    auto const compute = [&bands](BoundingRect const &) { ++bands; };
    auto const hasTime = [&bands] { return bands < 3; };
    // [bands]
    BoundingRect stale(Point(0, 0), Point(640, 480));
    while (!stale.isEmpty() && stale.height() > 0 && hasTime()) {
        Point const corner(stale.maximum().x, std::min(stale.minimum().y + 64, 480.f));
        BoundingRect const band(stale.minimum(), corner);
        compute(band);
        stale.subtract(band);
    }
    // [bands]
    EXPECT_EQ(stale.toString(), "0, 192   640, 480   ");
}

TEST(RegionsGuide, EverywhereAndNowhere) {
    size2 const picture(640, 480);
    // [everywhere]
    BoundingRegion changed(Point(10, 10), Point(20, 20));
    changed.makeEverywhere(); // an automatic exposure depends on every pixel and changes every one
    changed.outset(Point(24, 24));
    IntegerRect const all = PixelsOf(changed.boundingRect(), picture);
    // [o=(0 0), s=(640, 480)]

    changed.makeNowhere(); // all is drawn
    changed.outset(Point(24, 24));
    bool const nothingToDo = changed.isEmpty();
    // [everywhere]
    EXPECT_EQ(all, IntegerRect({0, 0}, picture));
    EXPECT_TRUE(nothingToDo);
}

} // namespace
