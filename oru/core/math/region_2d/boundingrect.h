// The axis-aligned rectangle as a region.
#pragma once

#include "oru/core/math/region_2d/boundingregionbase.h"

#include <limits>

namespace ORU {

/// A closed axis-aligned rectangle: the points p with minimum <= p <= maximum in both coordinates.
///
/// It is empty when a minimum is above its maximum, as after the intersection of disjoint
/// rectangles. No operation but `clone`, `convexHull` and `toString` allocates, also not with a
/// `BoundingRegion` as the other operand.
class ORU_API BoundingRect : public BoundingRegionBase {
public:
    /// Nowhere: minimum (+infinity, +infinity), maximum (-infinity, -infinity).
    BoundingRect() = default;

    /// The smallest rectangle with `a` and `b`, opposite corners in any order. A NaN coordinate is
    /// ignored.
    BoundingRect(ambra::lumo::TVec2<float> const &a, ambra::lumo::TVec2<float> const &b);

    BoundingRect(BoundingRect const &) = default;
    BoundingRect &operator=(BoundingRect const &) = default;
    ~BoundingRect() override;

    /// Everywhere.
    static BoundingRect InfinitePlane();

    /// The lower bounds; above `maximum()` when the rectangle is empty.
    ambra::lumo::TVec2<float> const &minimum() const { return minimum_; }
    /// The upper bounds, which belong to the rectangle.
    ambra::lumo::TVec2<float> const &maximum() const { return maximum_; }

    /// Negative for some empty rectangles, as is `height()`.
    float width() const { return maximum_.x - minimum_.x; }
    float height() const { return maximum_.y - minimum_.y; } ///< as `width()`

    /// Width times height; 0 for an empty rectangle, a line or a point.
    float area() const;

    BoundingRect *clone() const override;
    bool isEmpty() const override;
    void makeNowhere() override;
    void makeEverywhere() override;

    /// An empty rectangle becomes a copy of another rectangle, whatever that holds.
    void include(BoundingRegionBase const &region) override;
    void include(ambra::lumo::TVec2<float> const &p) override;

    bool contains(BoundingRegionBase const &region) const override;
    bool contains(ambra::lumo::TVec2<float> const &p) const override;

    /// Becomes nowhere when `region` is empty; an empty rectangle does not change.
    void intersect(BoundingRegionBase const &region) override;

    /// Takes off the sides that the rectangle around `region` covers whole: first above and below,
    /// then at the left and the right. What does not reach across this rectangle changes nothing.
    void subtract(BoundingRegionBase const &region) override;

    /// Uses the rectangle around `region`; becomes nowhere when it is empty.
    void dilate(BoundingRegionBase const &region) override;

    /// Becomes everywhere when `r` is empty.
    void erode(BoundingRect const &r) override;

    void translate(ambra::lumo::TVec2<float> const &d) override;

    /// The corners (min x, min y), (max x, min y), (max x, max y), (min x, max y).
    std::vector<ambra::lumo::TVec2<float>> convexHull() const override;

    BoundingRect boundingRect() const override;
    Representation representation() const override;

    /// "Empty", or the bounds, such as "0, 0   2, 3   ".
    std::string toString() const override;

private:
    using Vec = ambra::lumo::TVec2<float>;

    static BoundingRect RectFromHull(std::vector<Vec> const &hull);
    static BoundingRect RectAround(BoundingRegionBase const &region);
    static bool ContainsNaN(Vec p);
    static Vec Moved(Vec const &bound, Vec const &by);

    Vec minimum_{std::numeric_limits<float>::infinity(), std::numeric_limits<float>::infinity()};
    Vec maximum_{-std::numeric_limits<float>::infinity(), -std::numeric_limits<float>::infinity()};
};

/// Whether all four bounds are equal; a rectangle that holds a NaN is unequal to itself.
ORU_API bool operator==(BoundingRect const &a, BoundingRect const &b);
/// Not `==`.
ORU_API bool operator!=(BoundingRect const &a, BoundingRect const &b);

} // namespace ORU
