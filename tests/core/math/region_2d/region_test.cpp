// Bounding regions: the special regions, infinities, NaNs, and what the handle owns.
#include "triangle.h"

#include "tests/countinghooks.h"
#include "tests/messageof.h"

#include "oru/core/math/region_2d/boundingregion.h"

#include <gtest/gtest.h>

#include <sstream>

using ORU::BoundingRect;
using ORU::BoundingRegion;
using ORU::BoundingRegionBase;
using oru_test::MessageOf;
using oru_test::Triangle;
using oru_test::Vec;

namespace {

float const infinity = std::numeric_limits<float>::infinity();
float const nan = std::numeric_limits<float>::quiet_NaN();

BoundingRect Rect(float minX, float minY, float maxX, float maxY) {
    return BoundingRect(Vec(minX, minY), Vec(maxX, maxY));
}

/// `rect` after one operation.
template<class Operation>
BoundingRect After(BoundingRect rect, Operation operation) {
    operation(rect);
    return rect;
}

TEST(BoundingRect, IsMadeFromCornersInAnyOrder) {
    EXPECT_EQ(BoundingRect(Vec(3, 4), Vec(1, 2)), Rect(1, 2, 3, 4));
    EXPECT_EQ(BoundingRect(Vec(3, nan), Vec(1, 2)), Rect(1, 2, 3, 2));
    EXPECT_EQ(Rect(0, 1, 2, 4).area(), 6);
    EXPECT_EQ(BoundingRect().area(), 0);
    EXPECT_TRUE(BoundingRect::InfinitePlane().contains(Vec(-3e38f, infinity)));
    EXPECT_FALSE(BoundingRect::InfinitePlane().contains(Vec(0, nan)));
}

TEST(BoundingRect, KeepsTheBoundsOfEmptyResults) {
    BoundingRect const square = Rect(0, 0, 2, 2);
    BoundingRect disjoint = square;
    disjoint.intersect(Rect(3, 3, 4, 4));
    EXPECT_EQ(disjoint.minimum().x, 3);
    EXPECT_EQ(disjoint.maximum().x, 2);
    EXPECT_EQ(disjoint.area(), 0);

    // A rectangle hands its bounds on, another kind of region only its hull.
    BoundingRegion handle;
    handle.include(disjoint);
    EXPECT_EQ(After(BoundingRect(), [&](auto &r) { r.include(disjoint); }), disjoint);
    EXPECT_EQ(After(BoundingRect(), [&](auto &r) { r.include(handle); }), BoundingRect());
    EXPECT_EQ(After(disjoint, [&](auto &r) { r.include(BoundingRect()); }), BoundingRect());
    EXPECT_EQ(After(square, [&](auto &r) { r.include(disjoint); }), square);
    EXPECT_FALSE(square.contains(disjoint));
    EXPECT_TRUE(square.contains(handle));
    EXPECT_EQ(After(disjoint, [&](auto &r) { r.intersect(square); }), disjoint);
}

TEST(BoundingRect, LosesNoBoundToANaN) {
    BoundingRect const square = Rect(0, 0, 2, 2);
    BoundingRect const moved = After(square, [](auto &r) { r.translate(Vec(nan, 1)); });
    EXPECT_NE(moved, moved);
    EXPECT_EQ(After(square, [&](auto &r) { r.include(Vec(nan, 3)); }), Rect(0, 0, 2, 3));
    EXPECT_EQ(After(square, [&](auto &r) { r.include(moved); }), Rect(0, 0, 2, 3));
    EXPECT_EQ(After(square, [&](auto &r) { r.intersect(moved); }), Rect(0, 1, 2, 2));
    EXPECT_FALSE(square.contains(moved));
    // The hull of the moved rectangle bounds no x: it is empty where only a hull is seen.
    EXPECT_EQ(After(square, [&](auto &r) { r.subtract(moved); }), square);
    EXPECT_EQ(After(square, [&](auto &r) { r.dilate(moved); }), BoundingRect());
}

TEST(BoundingRect, SubtractsWhatReachesAcross) {
    BoundingRect const square = Rect(0, 0, 2, 2);
    auto const rest = [&](BoundingRect const &r) {
        return After(square, [&](auto &rect) { rect.subtract(r); });
    };
    EXPECT_EQ(rest(Rect(-1, -1, 3, 1)), Rect(0, 1, 2, 2));
    EXPECT_EQ(rest(Rect(1, 0, 5, 2)), Rect(0, 0, 1, 2));
    EXPECT_EQ(rest(Rect(1, 1, 1.5f, 1.5f)), square);
    EXPECT_EQ(rest(Rect(-infinity, 0, 1, infinity)), Rect(1, 0, 2, 2));
    EXPECT_EQ(rest(Rect(-1, 0, 3, 0)), square);
}

TEST(BoundingRegionBase, GrowsAndShrinksByChecksAndVirtualOperations) {
    BoundingRect square = Rect(0, 0, 2, 2);
    EXPECT_EQ(After(square, [](auto &r) { r.outset(Vec(1, 2)); }), Rect(-1, -2, 3, 4));
    Triangle triangle;
    triangle.outset(Vec(1, 2));
    triangle.inset(Vec(3, 0));
    EXPECT_EQ(triangle.dilatedBy_, Rect(-1, -2, 1, 2));
    EXPECT_EQ(triangle.erodedBy_, Rect(-3, 0, 3, 0));
    for (Vec const &bad : {Vec(-1, 0), Vec(0, -1), Vec(nan, 0), Vec(0, nan)}) {
        EXPECT_EQ(MessageOf([&] { square.outset(bad); }), "vOutset.x >= 0.f && vOutset.y >= 0.f");
        EXPECT_EQ(MessageOf([&] { square.inset(bad); }), "vInset.x >= 0.f && vInset.y >= 0.f");
    }
    EXPECT_EQ(square, Rect(0, 0, 2, 2));
}

TEST(BoundingRegionBase, IsWrittenAsText) {
    auto const text = [](BoundingRegionBase const &region) {
        std::ostringstream stream;
        stream << region;
        return stream.str();
    };
    EXPECT_EQ(text(Rect(-0.5f, 0, 1e10f, infinity)), "-0.5, 0   1e+10, inf   ");
    EXPECT_EQ(text(BoundingRect()), "Empty");
    EXPECT_EQ(text(BoundingRegion()), "[]");
    EXPECT_EQ(text(BoundingRegion(Vec(2, 3), Vec(0, 0))), "0, 0   2, 3   ");
}

TEST(BoundingRegion, CopiesAndFreesThroughTheHooks) {
    oru_test::CountingHooks hooks;
    {
        BoundingRegion region; // nowhere owns nothing
        region.makeNowhere();
        EXPECT_TRUE(BoundingRegion(region).isEmpty());
        EXPECT_TRUE(region.convexHull().empty());
        EXPECT_EQ(region.boundingRect(), BoundingRect());
        EXPECT_EQ(region.representation(), BoundingRegionBase::REPRESENTATION_OTHER);
        EXPECT_EQ(hooks.allocations(), 0);
        region.makeEverywhere();
        EXPECT_EQ(region.boundingRect(), BoundingRect::InfinitePlane());
        region.makeNowhere();
        EXPECT_EQ(hooks.outstanding().size(), 0u);

        BoundingRegion const source(Vec(0, 0), Vec(2, 2));
        BoundingRegion target(source);
        target.include(Vec(5, 5));
        EXPECT_EQ(source.boundingRect(), Rect(0, 0, 2, 2));
        target = source;
        target = *&target;
        BoundingRegion const moved(std::move(target));
        EXPECT_EQ(moved, source);
        EXPECT_EQ(hooks.outstanding().size(), 2u);
        ORU::ScopedPtr<BoundingRegionBase> const base(
            static_cast<BoundingRegionBase const &>(moved).clone());
        EXPECT_EQ(*dynamic_cast<BoundingRegion *>(base.get()), source);
        EXPECT_EQ(hooks.outstanding().size(), 4u);
        region.translate(Vec(1, 1)); // moves nothing
        region = source;
        region.intersect(BoundingRegion());
        EXPECT_EQ(region.representation(), BoundingRegionBase::REPRESENTATION_RECT);
        EXPECT_EQ(region, BoundingRegion());
    }
    EXPECT_EQ(hooks.outstanding().size(), 0u);
    EXPECT_EQ(hooks.wrongReleases(), 0);
}

} // namespace
