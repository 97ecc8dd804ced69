// That rectangles allocate nothing, counted in the library's objects: a DLL has its own operator
// new.
#include "tests/allocationcount.h"

#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/math/region_2d/boundingregion.h"

#include <gtest/gtest.h>

using ORU::BoundingRect;
using ORU::BoundingRegion;
using Vec = ambra::lumo::TVec2<float>;

namespace {

/// Every operation once, without a temporary that owns memory.
template<class Region>
bool UseAll(Region &region, ORU::BoundingRegionBase const &other) {
    region.makeEverywhere();
    region.intersect(other);
    region.include(other);
    region.include(Vec(9, 9));
    region.subtract(other);
    region.dilate(other);
    region.erode(BoundingRect(Vec(-1, -1), Vec(1, 1)));
    region.outset(Vec(2, 3));
    region.inset(Vec(1, 1));
    region.translate(Vec(4, 0));
    return region.contains(other) && region.contains(Vec(0, 0)) && region.boundingRect().isEmpty();
}

TEST(RegionAllocation, RectanglesNeedNone) {
    BoundingRect const rect(Vec(0, 0), Vec(4, 4));
    BoundingRegion const handle(Vec(1, 1), Vec(5, 5));
    BoundingRect target;
    BoundingRegion owner(Vec(0, 0), Vec(1, 1));
    long const before = oru_test::AllocationCount();
    UseAll(target, rect);
    UseAll(target, handle);
    UseAll(owner, rect);
    UseAll(owner, handle);
    EXPECT_EQ(oru_test::AllocationCount() - before, 0);
    EXPECT_FALSE(target.convexHull().empty());
    EXPECT_EQ(oru_test::AllocationCount() - before, 1) << "the count does not count";
}

} // namespace
