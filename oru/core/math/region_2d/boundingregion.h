// A region held by value, whatever its kind.
#pragma once

#include "oru/core/math/region_2d/boundingregionbase.h"
#include "oru/core/utility/scopedptr.h"

namespace ORU {

/// Owns a region, today always a `BoundingRect`, and forwards to it; copies copy the region.
///
/// A handle that is nowhere owns nothing: it allocates, through the memory hooks, when it first
/// becomes more than that, and frees when it becomes nowhere or dies. An operation of a handle
/// throws `std::bad_alloc` when memory for its region is exhausted.
///
/// ```cpp
/// BoundingRegion changed({10, 10}, {20, 15}); // a stroke of the brush
/// changed.include(BoundingRegion({40, 10}, {42, 12}));
/// changed.dilate(BoundingRect({-3, -3}, {3, 3})); // a blur of radius 3 spreads it
/// changed.intersect(BoundingRect({0, 0}, {width, height}));
/// BoundingRect const dirty = changed.boundingRect(); // has to be computed anew
/// ```
class ORU_API BoundingRegion : public BoundingRegionBase {
public:
    /// Nowhere.
    BoundingRegion() = default;

    /// The rectangle with the opposite corners `a` and `b`, in any order.
    BoundingRegion(ambra::lumo::TVec2<float> const &a, ambra::lumo::TVec2<float> const &b);

    BoundingRegion(BoundingRegion const &other);
    /// Takes over the region; `other` is nowhere afterwards.
    BoundingRegion(BoundingRegion &&other) noexcept = default;
    /// Frees its own region first; when copying fails, the handle is nowhere.
    BoundingRegion &operator=(BoundingRegion const &other);
    BoundingRegion &operator=(BoundingRegion &&other) noexcept = default;
    ~BoundingRegion() override;

    BoundingRegion *clone() const override;
    bool isEmpty() const override;
    void makeNowhere() override;
    void makeEverywhere() override;
    void include(BoundingRegionBase const &region) override;
    void include(ambra::lumo::TVec2<float> const &p) override;

    /// A handle that owns nothing contains nothing, not even an empty region.
    bool contains(BoundingRegionBase const &region) const override;
    bool contains(ambra::lumo::TVec2<float> const &p) const override;
    void intersect(BoundingRegionBase const &region) override;
    void subtract(BoundingRegionBase const &region) override;
    void dilate(BoundingRegionBase const &region) override;
    void erode(BoundingRect const &r) override;
    void translate(ambra::lumo::TVec2<float> const &d) override;
    std::vector<ambra::lumo::TVec2<float>> convexHull() const override;
    BoundingRect boundingRect() const override;
    /// That of the region owned; `REPRESENTATION_OTHER` without one.
    Representation representation() const override;
    /// That of the region owned; "[]" without one.
    std::string toString() const override;

private:
    explicit BoundingRegion(BoundingRect const &rect);

    /// The region owned, first made as a rectangle that is nowhere if there is none.
    BoundingRegionBase &internalRegion();

    ScopedPtr<BoundingRegionBase> region_;
};

/// Whether both are empty, or each contains the other.
ORU_API bool operator==(BoundingRegion const &a, BoundingRegion const &b);
/// Not `==`.
ORU_API bool operator!=(BoundingRegion const &a, BoundingRegion const &b);

} // namespace ORU
