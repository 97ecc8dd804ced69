// Bounding regions: the special regions, infinities, NaNs, and what the handle owns.
#include "triangle.h"

#include "../../countinghooks.h"

#include "oru/core/exceptions/internalexception.h"
#include "oru/core/math/region_2d/boundingregion.h"

#include <gmock/gmock.h>

#include <sstream>
#include <type_traits>

using ORU::BoundingRect;
using ORU::BoundingRegion;
using ORU::BoundingRegionBase;
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
    EXPECT_EQ(Rect(0, 1, 0, 4).area(), 0);

    BoundingRect nowhere;
    EXPECT_TRUE(nowhere.isEmpty());
    EXPECT_EQ(nowhere.area(), 0);
    EXPECT_EQ(nowhere.minimum().x, infinity);
    EXPECT_EQ(nowhere.maximum().y, -infinity);

    BoundingRect const plane = BoundingRect::InfinitePlane();
    EXPECT_TRUE(plane.contains(Vec(-3e38f, infinity)));
    EXPECT_FALSE(plane.contains(Vec(0, nan)));
    EXPECT_TRUE(plane.contains(plane));
}

TEST(BoundingRect, KeepsTheBoundsOfEmptyResults) {
    BoundingRect const square = Rect(0, 0, 2, 2);
    BoundingRect disjoint = square;
    disjoint.intersect(Rect(3, 3, 4, 4));
    EXPECT_TRUE(disjoint.isEmpty());
    EXPECT_EQ(disjoint.minimum().x, 3);
    EXPECT_EQ(disjoint.maximum().x, 2);
    EXPECT_EQ(disjoint.width(), -1);
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
    EXPECT_TRUE(square.contains(Triangle()));

    EXPECT_EQ(After(square, [&](auto &r) { r.intersect(disjoint); }), BoundingRect());
    EXPECT_EQ(After(disjoint, [&](auto &r) { r.intersect(square); }), disjoint);
    EXPECT_EQ(After(square, [&](auto &r) { r.subtract(disjoint); }), square);
    EXPECT_EQ(After(square, [&](auto &r) { r.dilate(disjoint); }), BoundingRect());
    EXPECT_EQ(After(square, [&](auto &r) { r.erode(disjoint); }), BoundingRect::InfinitePlane());
}

TEST(BoundingRect, KeepsInfiniteBounds) {
    BoundingRect const plane = BoundingRect::InfinitePlane();
    BoundingRect const half = Rect(0, -infinity, infinity, infinity);
    for (BoundingRect const &r : {plane, half, Rect(-1, -1, 1, 1)}) {
        EXPECT_EQ(After(BoundingRect(), [&](auto &rect) { rect.dilate(r); }), BoundingRect());
        EXPECT_EQ(After(BoundingRect(), [&](auto &rect) { rect.erode(r); }), BoundingRect());
        EXPECT_EQ(After(plane, [&](auto &rect) { rect.dilate(r); }), plane);
        EXPECT_EQ(After(plane, [&](auto &rect) { rect.erode(r); }), plane);
    }
    EXPECT_TRUE(After(Rect(0, 0, 9, 9), [&](auto &rect) { rect.erode(half); }).isEmpty());
    EXPECT_TRUE(After(plane, [&](auto &rect) { rect.subtract(plane); }).isEmpty());
    EXPECT_EQ(After(plane, [&](auto &rect) { rect.subtract(half); }),
              Rect(-infinity, -infinity, 0, infinity));
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
    EXPECT_EQ(rest(Rect(0, 1, 2, 2)), Rect(0, 0, 2, 1));
    EXPECT_EQ(rest(Rect(1, 0, 5, 2)), Rect(0, 0, 1, 2));
    EXPECT_EQ(rest(Rect(1, 1, 1.5f, 1.5f)), square);
    EXPECT_EQ(rest(Rect(0.5f, 0, 1.5f, 2)), square);
    EXPECT_EQ(rest(Rect(-1, 0, 3, 0)), square);
    EXPECT_TRUE(rest(square).isEmpty());
}

TEST(BoundingRegionBase, GrowsAndShrinksByChecksAndVirtualOperations) {
    BoundingRect square = Rect(0, 0, 2, 2);
    EXPECT_EQ(After(square, [](auto &r) { r.outset(Vec(1, 2)); }), Rect(-1, -2, 3, 4));
    EXPECT_EQ(After(square, [](auto &r) { r.inset(Vec(1, 1)); }), Rect(1, 1, 1, 1));
    EXPECT_TRUE(After(square, [](auto &r) { r.inset(Vec(1.5f, 0)); }).isEmpty());
    Triangle triangle;
    triangle.outset(Vec(1, 2));
    triangle.inset(Vec(3, 0));
    EXPECT_EQ(triangle.dilatedBy_, Rect(-1, -2, 1, 2));
    EXPECT_EQ(triangle.erodedBy_, Rect(-3, 0, 3, 0));
    EXPECT_EQ(triangle.representation(), BoundingRegionBase::REPRESENTATION_OTHER);

    for (Vec const &bad : {Vec(-1, 0), Vec(0, -1), Vec(nan, 0), Vec(0, nan)}) {
        try {
            square.outset(bad);
            FAIL() << bad.x << ", " << bad.y;
        } catch (ORU::InternalException const &e) {
            EXPECT_STREQ(e.message(), "vOutset.x >= 0.f && vOutset.y >= 0.f");
        }
        try {
            square.inset(bad);
            FAIL() << bad.x << ", " << bad.y;
        } catch (ORU::InternalException const &e) {
            EXPECT_STREQ(e.message(), "vInset.x >= 0.f && vInset.y >= 0.f");
        }
    }
    EXPECT_EQ(square, Rect(0, 0, 2, 2));
}

TEST(BoundingRegionBase, IsWrittenAsText) {
    auto const text = [](BoundingRegionBase const &region) {
        std::ostringstream stream;
        stream << region;
        return stream.str();
    };
    EXPECT_EQ(text(Rect(0, 0, 2, 3)), "0, 0   2, 3   ");
    EXPECT_EQ(text(Rect(-0.5f, 0, 1e10f, infinity)), "-0.5, 0   1e+10, inf   ");
    EXPECT_EQ(text(BoundingRect()), "Empty");
    EXPECT_EQ(text(BoundingRegion()), "[]");
    EXPECT_EQ(text(BoundingRegion(Vec(2, 3), Vec(0, 0))), "0, 0   2, 3   ");
    EXPECT_EQ(text(Triangle()), "Triangle");
}

TEST(BoundingRegion, OwnsNothingWhileItIsNowhere) {
    oru_test::CountingHooks hooks;
    BoundingRegion region;
    region.makeNowhere();
    BoundingRegion const copy(region);
    EXPECT_TRUE(region.isEmpty());
    EXPECT_FALSE(region.contains(Vec(0, 0)));
    EXPECT_FALSE(region.contains(copy));
    EXPECT_TRUE(region.convexHull().empty());
    EXPECT_EQ(region.boundingRect(), BoundingRect());
    EXPECT_EQ(region.representation(), BoundingRegionBase::REPRESENTATION_OTHER);
    EXPECT_EQ(hooks.allocations(), 0);

    BoundingRegion emptied(Vec(0, 0), Vec(1, 1));
    emptied.intersect(region);
    EXPECT_EQ(emptied.representation(), BoundingRegionBase::REPRESENTATION_RECT);
    EXPECT_EQ(emptied, region);
    EXPECT_NE(BoundingRegion(Vec(0, 0), Vec(1, 1)), region);

    region.makeEverywhere();
    EXPECT_EQ(region.boundingRect(), BoundingRect::InfinitePlane());
    EXPECT_EQ(hooks.outstanding().size(), 2u);
    region.makeNowhere();
    EXPECT_EQ(hooks.outstanding().size(), 1u);
}

TEST(BoundingRegion, CopiesAndFreesThroughTheHooks) {
    oru_test::CountingHooks hooks;
    {
        BoundingRegion const source(Vec(0, 0), Vec(2, 2));
        BoundingRegion target(source);
        target.include(Vec(5, 5));
        EXPECT_EQ(source.boundingRect(), Rect(0, 0, 2, 2));
        target = source;
        EXPECT_EQ(hooks.outstanding().size(), 2u);
        EXPECT_EQ(target, source);
        target = *&target;
        EXPECT_EQ(target, source);

        BoundingRegion const moved(std::move(target));
        EXPECT_EQ(moved, source);
        EXPECT_EQ(hooks.outstanding().size(), 2u);

        ORU::ScopedPtr<BoundingRegion> const clone(moved.clone());
        ORU::ScopedPtr<BoundingRegionBase> const base(
            static_cast<BoundingRegionBase const &>(*clone).clone());
        EXPECT_EQ(*dynamic_cast<BoundingRegion *>(base.get()), source);
        EXPECT_EQ(hooks.outstanding().size(), 6u);
        for (auto const &allocation : hooks.outstanding()) {
            EXPECT_EQ(allocation.second.type, ORU::MEMORYTYPE_DEFAULT);
            EXPECT_THAT(allocation.second.file,
                        testing::StartsWith("oru/core/math/region_2d/bounding"));
        }
        BoundingRegion nowhere;
        nowhere.translate(Vec(1, 1));
        nowhere = BoundingRegion();
    }
    EXPECT_EQ(hooks.outstanding().size(), 0u);
    EXPECT_EQ(hooks.wrongReleases(), 0);
}

} // namespace
