// Laws of the bounding regions over a million random cases of every kind.
#include "triangle.h"

#include "oru/core/math/region_2d/boundingregion.h"

#include <gtest/gtest.h>

#include <array>
#include <ostream>
#include <random>

using ORU::BoundingRect;
using ORU::BoundingRegion;
using ORU::BoundingRegionBase;
using oru_test::Triangle;
using oru_test::Vec;

namespace {

/// Multiples of 1/2 from -6 to 6: few, so that regions often touch, and exact in every sum.
class Source {
public:
    explicit Source(unsigned seed) : engine_(seed) {}

    bool oneIn(unsigned n) { return engine_() % n == 0; }
    float number() { return static_cast<float>(static_cast<int>(engine_() % 25) - 12) / 2; }
    Vec point() { return Vec(number(), number()); }

    BoundingRect rect() {
        if (oneIn(16))
            return BoundingRect();
        if (oneIn(16)) { // empty with finite bounds
            BoundingRect rect(Vec(-6, -1), Vec(number(), 1));
            rect.intersect(BoundingRect(Vec(rect.maximum().x + 1, -1), Vec(8, 1)));
            return rect;
        }
        float const infinity = std::numeric_limits<float>::infinity();
        Vec low = point();
        Vec high = point();
        bool const isEverywhere = oneIn(32);
        for (float *bound : {&low.x, &low.y})
            if (isEverywhere || oneIn(16))
                *bound = -infinity;
        for (float *bound : {&high.x, &high.y})
            if (isEverywhere || oneIn(16))
                *bound = infinity;
        return BoundingRect(low, high);
    }

private:
    std::minstd_rand engine_;
};

/// Two operands, the second of any kind, a third region to compare with and points to look at.
struct Case {
    explicit Case(Source &source) : a(source.rect()), rect(source.rect()), c(source.rect()) {
        for (Vec &point : points)
            point = source.point();
        shift = source.point();
        if (source.oneIn(3)) {
            triangle = Triangle({source.point(), source.point(), source.point()});
            b = &triangle;
            rect = triangle.boundingRect();
        } else if (source.oneIn(2)) {
            handle.include(rect);
            b = &handle;
        } else {
            b = &rect;
        }
        usesHandle = source.oneIn(2);
    }
    Case(Case const &) = delete;
    Case &operator=(Case const &) = delete;

    /// `a` after an operation, made by the rectangle itself or through a handle.
    template<class Operation>
    BoundingRect after(Operation operation) const {
        if (usesHandle) {
            BoundingRegion region;
            region.include(a);
            operation(region);
            return region.boundingRect();
        }
        BoundingRect region = a;
        operation(region);
        return region;
    }

    BoundingRect a;
    BoundingRect rect; ///< around `b`
    Triangle triangle;
    BoundingRegion handle;
    BoundingRegionBase const *b;
    BoundingRect c;
    std::array<Vec, 6> points;
    Vec shift;
    bool usesHandle;
};

std::ostream &operator<<(std::ostream &os, Case const &c) {
    os << "a: " << c.a << "; b: " << *c.b << " in " << c.rect << "; c: " << c.c << "; points:";
    for (Vec const &p : c.points)
        os << " (" << p.x << ", " << p.y << ")";
    return os << "; handle: " << c.usesHandle;
}

bool Inside(BoundingRect const &rect, Vec const &p) {
    return rect.minimum().x <= p.x && p.x <= rect.maximum().x && rect.minimum().y <= p.y &&
           p.y <= rect.maximum().y;
}

Vec Sum(Vec const &p, Vec const &q) {
    return Vec(p.x + q.x, p.y + q.y);
}

bool Implies(bool a, bool b) {
    return !a || b;
}

#define HOLDS(law)                                                                                 \
    if (!(law))                                                                                    \
    return #law

/// The first law of the plain model that a case breaks, null if it breaks none.
char const *BrokenPointLaw(Case const &given) {
    BoundingRect const &a = given.a;
    BoundingRegionBase const &b = *given.b;
    BoundingRect const &r = given.rect;
    BoundingRect const u = given.after([&](auto &region) { region.include(b); });
    BoundingRect const i = given.after([&](auto &region) { region.intersect(b); });
    BoundingRect const s = given.after([&](auto &region) { region.subtract(b); });
    BoundingRect const d = given.after([&](auto &region) { region.dilate(b); });
    BoundingRect const e = given.after([&](auto &region) { region.erode(r); });
    BoundingRect const t = given.after([&](auto &region) { region.translate(given.shift); });
    for (Vec const &p : given.points) {
        bool const inA = Inside(a, p);
        bool const inB = b.contains(p);
        bool const inR = Inside(r, p);
        HOLDS(inA == a.contains(p));
        HOLDS(given.b == &given.triangle || inB == inR);
        HOLDS(Implies(inB && a.contains(b), inA));
        HOLDS(Implies(inA || inB, Inside(u, p)));
        HOLDS(Inside(i, p) == (inA && inR && !b.isEmpty()));
        HOLDS(Implies(inA && !inR, Inside(s, p)));
        HOLDS(Implies(Inside(s, p), inA));
        HOLDS(Inside(t, Sum(p, given.shift)) == inA);
        for (Vec const &q : given.points)
            HOLDS(Implies(inA && b.contains(q), Inside(d, Sum(p, q))));
        bool const readsOnlyA = Inside(a, Sum(p, r.minimum())) && Inside(a, Sum(p, r.maximum()));
        HOLDS(Inside(e, p) == (r.isEmpty() || readsOnlyA));
    }
    return nullptr;
}

/// The same for the laws of order between whole regions, which also say that bounds are tight.
char const *BrokenOrderLaw(Case const &given) {
    BoundingRect const &a = given.a;
    BoundingRect const &c = given.c;
    BoundingRegionBase const &b = *given.b;
    BoundingRect const &r = given.rect;
    HOLDS(b.isEmpty() == r.isEmpty());
    HOLDS(b.isEmpty() == b.convexHull().empty());
    BoundingRegion handleA, handleR;
    handleA.include(a);
    handleR.include(r);
    bool const bothEmpty = a.isEmpty() && r.isEmpty();
    HOLDS((handleA == handleR) == (bothEmpty || (!a.isEmpty() && !r.isEmpty() && a == r)));
    if (a.isEmpty() || b.isEmpty() || c.isEmpty())
        return nullptr;

    BoundingRect const u = given.after([&](auto &region) { region.include(b); });
    HOLDS(u.contains(a) && u.contains(b));
    HOLDS((u == a) == a.contains(b));
    HOLDS(Implies(c.contains(a) && c.contains(b), c.contains(u)));

    BoundingRect const i = given.after([&](auto &region) { region.intersect(b); });
    HOLDS(i.contains(c) == (a.contains(c) && r.contains(c)));

    BoundingRect const s = given.after([&](auto &region) { region.subtract(b); });
    HOLDS(s.isEmpty() || a.contains(s));
    HOLDS(Implies(r.area() > 0 && r.contains(a), s.isEmpty()));
    BoundingRect again = s;
    again.subtract(b);
    HOLDS(s.isEmpty() || again == s);

    // Dilation and erosion are adjoint: what spreads only within c is what c eroded holds.
    BoundingRect const d = given.after([&](auto &region) { region.dilate(b); });
    BoundingRect inner = c;
    inner.erode(r);
    HOLDS(c.contains(d) == inner.contains(a));

    Vec const v(std::abs(given.shift.x), std::abs(given.shift.y));
    BoundingRect const o = given.after([&](auto &region) { region.outset(v); });
    BoundingRect back = o;
    back.inset(v);
    HOLDS(o.contains(a) && back == a);

    BoundingRect hull;
    for (Vec const &p : a.convexHull())
        hull.include(p);
    HOLDS(hull == a);
    return nullptr;
}

TEST(RegionProperties, HoldInAMillionCases) {
    Source source(2);
    for (int n = 0; n < 1000000; ++n) {
        Case const given(source);
        ASSERT_STREQ(BrokenPointLaw(given), nullptr) << "case " << n << ", " << given;
        ASSERT_STREQ(BrokenOrderLaw(given), nullptr) << "case " << n << ", " << given;
    }
}

} // namespace
