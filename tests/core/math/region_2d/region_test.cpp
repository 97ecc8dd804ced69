// Bounding regions: empty ones, NaNs, what the handle owns, laws over random cases.
#include "tests/support/allocationcount.h"
#include "tests/support/countinghooks.h"
#include "tests/support/failure.h"

#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/math/region_2d/boundingregion.h"

#include <array>
#include <random>

using namespace ORU;
using Vec = ambra::lumo::TVec2<float>;

namespace {

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();

BoundingRect Rect(float minX, float minY, float maxX, float maxY) {
    return BoundingRect(Vec(minX, minY), Vec(maxX, maxY));
}

/// `rect` after an operation, which must do the same to a handle that owns it.
template<class Operation>
BoundingRect After(BoundingRect rect, Operation operation) {
    BoundingRegion handle;
    handle.include(rect);
    operation(handle);
    operation(rect);
    bool const hasNaN = rect != rect; // NOLINT(misc-redundant-expression)
    if (!hasNaN && handle.boundingRect() != rect)
        ADD_FAILURE() << rect << " is in a handle " << handle;
    return rect;
}

TEST(BoundingRect, KeepsTheBoundsOfEmptyResults) {
    BoundingRect const square = Rect(2, 0, 0, 2);
    BoundingRect const disjoint = After(square, [](auto &r) { r.intersect(Rect(3, 3, 4, 4)); });
    EXPECT_EQ(disjoint.minimum().x, 3);
    EXPECT_EQ(disjoint.maximum().x, 2);
}

TEST(BoundingRect, LosesNoBoundToANaN) {
    BoundingRect const square = Rect(0, 0, 2, 2);
    BoundingRect const moved = After(square, [](auto &r) { r.translate(Vec(kNaN, 1)); });
    EXPECT_EQ(BoundingRect(Vec(3, kNaN), Vec(1, 2)), Rect(1, 2, 3, 2));
    EXPECT_EQ(After(square, [&](auto &r) { r.include(Vec(kNaN, 3)); }), Rect(0, 0, 2, 3));
    EXPECT_EQ(After(square, [&](auto &r) { r.include(moved); }), Rect(0, 0, 2, 3));
    BoundingRegion ofOtherKind; // whose corners are asked
    ofOtherKind.include(moved);
    EXPECT_EQ(After(square, [&](auto &r) { r.include(ofOtherKind); }), Rect(0, 0, 2, 3));
    EXPECT_EQ(After(square, [&](auto &r) { r.intersect(moved); }), Rect(0, 1, 2, 2));
    EXPECT_FALSE(square.contains(moved));
    // The hull of the moved rectangle bounds no x: it is empty where only a hull is seen.
    EXPECT_EQ(After(square, [&](auto &r) { r.dilate(moved); }), BoundingRect());
}

TEST(BoundingRect, SubtractsWhatReachesAcross) {
    auto const rest = [](BoundingRect const &taken) {
        return After(Rect(0, 0, 2, 2), [&](auto &r) { r.subtract(taken); });
    };
    EXPECT_EQ(rest(Rect(-1, -1, 3, 1)), Rect(0, 1, 2, 2));
    EXPECT_EQ(rest(Rect(0, 1, 2, 2)), Rect(0, 0, 2, 1));
    EXPECT_EQ(rest(Rect(1, 0, 5, 2)), Rect(0, 0, 1, 2));
    EXPECT_EQ(rest(Rect(-kInfinity, 0, 1, kInfinity)), Rect(1, 0, 2, 2));
}

TEST(BoundingRect, MovesByItsOwnBounds) {
    BoundingRect rect = Rect(1, 2, 3, 4);
    rect.translate(rect.minimum());
    EXPECT_EQ(rect, Rect(2, 4, 4, 6));
}

TEST(BoundingRegionBase, RefusesToGrowByLessThanNothing) {
    BoundingRect rect = Rect(0, 0, 2, 2);
    for (Vec const &bad : {Vec(-1, 0), Vec(0, -1), Vec(kNaN, 0), Vec(0, kNaN)}) {
        EXPECT_FAILURE("vOutset.x >= 0.f && vOutset.y >= 0.f", rect.outset(bad));
        EXPECT_FAILURE("vInset.x >= 0.f && vInset.y >= 0.f", rect.inset(bad));
    }
}

TEST(BoundingRegion, CopiesAndFreesThroughTheHooks) {
    oru_test::CountingHooks hooks;
    {
        BoundingRegion region; // nowhere owns nothing
        EXPECT_TRUE(BoundingRegion(region).convexHull().empty());
        EXPECT_EQ(testing::PrintToString(region), "[]");
        EXPECT_EQ(hooks.allocations(), 0);
        BoundingRegion const source(Vec(2, 3), Vec(0, 0));
        BoundingRegion target(source);
        target.include(Vec(5, 5));
        EXPECT_EQ(testing::PrintToString(source), "0, 0   2, 3   ");
        target = source;
        target = *&target;
        ORU::ScopedPtr<BoundingRegionBase> const base(
            static_cast<BoundingRegionBase const &>(target).clone());
        EXPECT_EQ(*dynamic_cast<BoundingRegion *>(base.get()), source);
        region.makeEverywhere();
        region.makeNowhere();
        EXPECT_EQ(hooks.outstanding().size(), 4u);
        region = source;
        region.intersect(BoundingRegion());
        EXPECT_EQ(region, BoundingRegion());
        EXPECT_EQ(testing::PrintToString(region), "Empty");
    }
    EXPECT_TRUE(hooks.outstanding().empty());
    EXPECT_EQ(hooks.wrongReleases(), 0);
}

/// A region that is no rectangle, of which others see the hull only.
struct Triangle : BoundingRegion {
    bool isEmpty() const override { return false; }
    std::vector<Vec> convexHull() const override { return corners; }
    std::vector<Vec> corners;
};

class Source {
public:
    unsigned below(unsigned n) { return static_cast<unsigned>(engine_() % n); }
    /// Multiples of 1/2 from -6 to 6: few, so that regions often touch, and exact in every sum.
    float number() { return (static_cast<float>(below(25)) - 12) / 2; }
    Vec point() { return Vec(number(), number()); }
    BoundingRect rect() {
        Vec low = point(), high = point();
        for (float *bound : {&low.x, &low.y})
            *bound = below(8) == 0 ? -kInfinity : *bound;
        for (float *bound : {&high.x, &high.y})
            *bound = below(8) == 0 ? kInfinity : *bound;
        BoundingRect rect(low, high);
        if (below(8) == 0) // often empty with finite bounds
            rect.intersect(BoundingRect(point(), point()));
        return below(16) == 0 ? BoundingRect() : rect;
    }

private:
    std::minstd_rand engine_{2};
};

bool Inside(BoundingRect const &rect, Vec const &p) {
    return rect.minimum().x <= p.x && p.x <= rect.maximum().x && rect.minimum().y <= p.y &&
           p.y <= rect.maximum().y;
}

Vec Sum(Vec const &p, Vec const &q) {
    return Vec(p.x + q.x, p.y + q.y);
}

#define HOLDS(law)                                                                                 \
    if (!(law))                                                                                    \
    return #law

/// The first law that a random case breaks, null if it breaks none.
char const *BrokenLaw(Source &source) {
    // The second operand is a rectangle, a handle of one, or a triangle, and r what surrounds it.
    BoundingRect const a = source.rect(), c = source.rect();
    BoundingRect r = source.rect();
    BoundingRegion handleA, handleR;
    handleA.include(a);
    handleR.include(r);
    Triangle triangle;
    triangle.corners = {source.point(), source.point(), source.point()};
    BoundingRegionBase const *const kinds[] = {&r, &handleR, &triangle};
    BoundingRegionBase const &b = *kinds[source.below(3)];
    HOLDS((handleA == handleR) == ((a.isEmpty() && r.isEmpty()) || (!a.isEmpty() && a == r)));
    if (&b == &triangle) {
        r = BoundingRect(triangle.corners[0], triangle.corners[1]);
        r.include(triangle.corners[2]);
    }
    Vec const shift = source.point(), v(std::abs(shift.x), std::abs(shift.y));
    std::array<Vec, 6> points;
    for (Vec &point : points)
        point = source.point();

    long const before = oru_test::AllocationCount();
    BoundingRect const u = After(a, [&](auto &region) { region.include(b); });
    BoundingRect const i = After(a, [&](auto &region) { region.intersect(b); });
    BoundingRect const s = After(a, [&](auto &region) { region.subtract(b); });
    BoundingRect const d = After(a, [&](auto &region) { region.dilate(b); });
    BoundingRect const e = After(a, [&](auto &region) { region.erode(r); });
    BoundingRect const t = After(a, [&](auto &region) { region.translate(shift); });
    // Each handle allocates one rectangle; only a region that is none is asked for its hull.
    HOLDS(&b == &triangle || oru_test::AllocationCount() - before == 6);
    for (Vec const &p : points) {
        bool const inA = Inside(a, p), inR = Inside(r, p);
        HOLDS(inA == a.contains(p));
        HOLDS(&b == &triangle || inR == b.contains(p));
        HOLDS(Inside(i, p) == (inA && inR));
        HOLDS(!inA || inR || Inside(s, p));
        HOLDS(!Inside(s, p) || inA);
        HOLDS(Inside(t, Sum(p, shift)) == inA);
        for (Vec const &q : points)
            HOLDS(!inA || !Inside(r, q) || Inside(d, Sum(p, q)));
        bool const readsOnlyA = Inside(a, Sum(p, r.minimum())) && Inside(a, Sum(p, r.maximum()));
        HOLDS(Inside(e, p) == (r.isEmpty() || readsOnlyA));
    }

    // What is empty leaves the other as it is, or takes all of it; its own bounds are handed on by
    // a rectangle, while another kind of region shows only its hull.
    BoundingRect const nowhere;
    HOLDS(!r.isEmpty() || (i == nowhere && d == nowhere && s == a && (a.isEmpty() || u == a)));
    HOLDS(!a.isEmpty() || r.isEmpty() || i == a);
    HOLDS(!a.isEmpty() || u == (&b == &r || !r.isEmpty() ? r : nowhere));

    // Laws of order, which also say that bounds are tight.
    HOLDS(b.isEmpty() == r.isEmpty() && b.isEmpty() == b.convexHull().empty());
    if (a.isEmpty() || b.isEmpty() || c.isEmpty())
        return nullptr;
    HOLDS(u.contains(a) && u.contains(b) && (u == a) == a.contains(b));
    HOLDS(!c.contains(a) || !c.contains(b) || c.contains(u));
    HOLDS(i.contains(c) == (a.contains(c) && r.contains(c)));
    HOLDS(s.isEmpty() || a.contains(s));
    HOLDS(r.area() == 0 || !r.contains(a) || s.isEmpty());
    HOLDS(s.isEmpty() || After(s, [&](auto &region) { region.subtract(b); }) == s);
    // Dilation and erosion are adjoint: what spreads only within c is what c eroded holds.
    HOLDS(c.contains(d) == After(c, [&](auto &region) { region.erode(r); }).contains(a));
    BoundingRect const o = After(a, [&](auto &region) { region.outset(v); });
    HOLDS(o == After(a, [&](auto &region) { region.dilate(BoundingRect(v, Vec(-v.x, -v.y))); }));
    HOLDS(After(o, [&](auto &region) { region.inset(v); }) == a);
    HOLDS(After(BoundingRect(), [&](auto &region) {
              for (Vec const &p : a.convexHull())
                  region.include(p);
          }) == a);
    return nullptr;
}

TEST(BoundingRegion, KeepsItsLawsInAMillionCases) {
    Source source;
    for (int n = 0; n < 1000000; ++n)
        ASSERT_STREQ(BrokenLaw(source), nullptr) << "case " << n;
}

} // namespace
