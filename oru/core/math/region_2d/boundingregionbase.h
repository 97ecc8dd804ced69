// The interface of conservative 2-D regions.
#pragma once

#include "oru/core/math/tvec2.h"
#include "oru/core/utility/export.h"

#include <iosfwd>
#include <string>
#include <vector>

namespace ORU {

class BoundingRect;

/// A region of the plane that stands for a bound: it contains what it describes, and may contain
/// more.
///
/// Coordinates are in whatever unit the caller counts in, usually pixels. Two regions are special:
/// nowhere, which is empty, and everywhere, which is infinite. An operation with a region of
/// another kind sees it through `convexHull()`.
class ORU_API BoundingRegionBase {
public:
    /// What a region is, exactly.
    enum Representation {
        REPRESENTATION_RECT = 0, ///< an axis-aligned rectangle, which `boundingRect()` gives
        REPRESENTATION_OTHER = 1 ///< anything else
    };

    virtual ~BoundingRegionBase();

    /// A heap copy, allocated through the memory hooks; the caller owns it and frees it with
    /// `ORUDeleter<BoundingRegionBase>`.
    /// @throws std::bad_alloc when memory is exhausted
    virtual BoundingRegionBase *clone() const = 0;

    virtual bool isEmpty() const = 0; ///< Whether the region has no point, as nowhere has none.

    virtual void makeNowhere() = 0;    ///< Becomes empty.
    virtual void makeEverywhere() = 0; ///< Becomes the whole plane.

    /// Grows to contain `region` as well (union).
    virtual void include(BoundingRegionBase const &region) = 0;

    /// Grows to contain the point `p` as well.
    virtual void include(ambra::lumo::TVec2<float> const &p) = 0;

    /// Whether all of `region` is inside, borders included.
    virtual bool contains(BoundingRegionBase const &region) const = 0;

    /// Whether the point `p` is inside or on the border; false for a NaN.
    virtual bool contains(ambra::lumo::TVec2<float> const &p) const = 0;

    /// Shrinks to what lies in `region` as well.
    virtual void intersect(BoundingRegionBase const &region) = 0;

    /// Shrinks by what lies in the rectangle around `region`, as far as a bound of the rest allows.
    virtual void subtract(BoundingRegionBase const &region) = 0;

    /// Grows to contain the sum p + q of every point p inside and q in `region` (Minkowski sum):
    /// where a filter whose footprint is `region` spreads what is inside.
    virtual void dilate(BoundingRegionBase const &region) = 0;

    /// Shrinks to the points p whose sum p + q with every point q of `r` is inside (Minkowski
    /// difference): where a filter whose footprint is `r` reads only what is inside.
    virtual void erode(BoundingRect const &r) = 0;

    /// Grows by `margin.x` at the left and at the right, and by `margin.y` above and below.
    /// @throws InternalException when a component is negative or a NaN
    virtual void outset(ambra::lumo::TVec2<float> const &margin);

    /// Shrinks by `margin.x` at the left and at the right, and by `margin.y` above and below,
    /// perhaps to nothing.
    /// @throws InternalException when a component is negative or a NaN
    virtual void inset(ambra::lumo::TVec2<float> const &margin);

    /// Moves the region by `d`.
    virtual void translate(ambra::lumo::TVec2<float> const &d) = 0;

    /// The corners of a convex polygon that contains the region; none for an empty region.
    virtual std::vector<ambra::lumo::TVec2<float>> convexHull() const = 0;

    /// The smallest known rectangle that contains the region.
    virtual BoundingRect boundingRect() const = 0;

    /// `REPRESENTATION_OTHER` unless a class says more.
    virtual Representation representation() const;

    /// The region in words, for people.
    virtual std::string toString() const = 0;

protected:
    /// Copied only as part of a whole region, never by its base alone.
    BoundingRegionBase() = default;
    BoundingRegionBase(BoundingRegionBase const &) = default;
    BoundingRegionBase &operator=(BoundingRegionBase const &) = default;
};

/// Writes `toString()`.
ORU_API std::ostream &operator<<(std::ostream &os, BoundingRegionBase const &region);

} // namespace ORU
