// The axis-aligned rectangle as a region.
#include "oru/core/math/region_2d/boundingrect.h"

#include "oru/core/memory/orumemory.h"
#include "oru/core/utility/composetext.h"

#include <cmath>

namespace ORU {

namespace {

using Vec = ambra::lumo::TVec2<float>;

// Written so that a NaN never replaces a bound: its comparison fails.

float Lower(float bound, float p) {
    return bound > p ? p : bound;
}

float Higher(float bound, float p) {
    return p > bound ? p : bound;
}

Vec Lower(Vec const &bound, Vec const &p) {
    return Vec(Lower(bound.x, p.x), Lower(bound.y, p.y));
}

Vec Higher(Vec const &bound, Vec const &p) {
    return Vec(Higher(bound.x, p.x), Higher(bound.y, p.y));
}

/// One coordinate of a subtraction: takes from [minimum, maximum] the ends that [low, high] covers.
void Trim(float &minimum, float &maximum, float low, float high) {
    if (low <= minimum && minimum < high)
        minimum = high;
    if (low < maximum && maximum <= high)
        maximum = low;
}

} // namespace

BoundingRect::BoundingRect(Vec const &a, Vec const &b) {
    minimum_ = Lower(Lower(minimum_, a), b);
    maximum_ = Higher(Higher(maximum_, a), b);
}

BoundingRect::~BoundingRect() = default;

BoundingRect BoundingRect::InfinitePlane() {
    BoundingRect plane;
    plane.makeEverywhere();
    return plane;
}

float BoundingRect::area() const {
    return maximum_.x > minimum_.x && maximum_.y > minimum_.y ? width() * height() : 0;
}

BoundingRect *BoundingRect::clone() const {
    return ORU_NEW BoundingRect(*this);
}

bool BoundingRect::isEmpty() const {
    return minimum_.x > maximum_.x || minimum_.y > maximum_.y;
}

void BoundingRect::makeNowhere() {
    *this = BoundingRect();
}

void BoundingRect::makeEverywhere() {
    float const infinity = std::numeric_limits<float>::infinity();
    minimum_ = Vec(-infinity, -infinity);
    maximum_ = Vec(infinity, infinity);
}

void BoundingRect::include(BoundingRegionBase const &region) {
    auto const *const rect = dynamic_cast<BoundingRect const *>(&region);
    BoundingRect const r = rect ? *rect : RectAround(region);
    if (isEmpty()) {
        *this = r;
    } else if (!region.isEmpty()) { // r, where NaNs are left out, can be empty when it is not
        minimum_ = Lower(minimum_, r.minimum_);
        maximum_ = Higher(maximum_, r.maximum_);
    }
}

void BoundingRect::include(Vec const &p) {
    minimum_ = Lower(minimum_, p);
    maximum_ = Higher(maximum_, p);
}

bool BoundingRect::contains(BoundingRegionBase const &region) const {
    if (auto const *const rect = dynamic_cast<BoundingRect const *>(&region))
        return contains(rect->minimum_) && contains(rect->maximum_);
    if (region.representation() == REPRESENTATION_RECT)
        return region.isEmpty() || contains(region.boundingRect());
    for (Vec const &p : region.convexHull())
        if (!contains(p))
            return false;
    return true;
}

bool BoundingRect::contains(Vec const &p) const {
    return minimum_.x <= p.x && p.x <= maximum_.x && minimum_.y <= p.y && p.y <= maximum_.y;
}

void BoundingRect::intersect(BoundingRegionBase const &region) {
    if (region.isEmpty()) {
        makeNowhere();
        return;
    }
    if (isEmpty())
        return;
    auto const *const rect = dynamic_cast<BoundingRect const *>(&region);
    BoundingRect const r = rect ? *rect : RectAround(region);
    minimum_ = Higher(minimum_, r.minimum_);
    maximum_ = Lower(maximum_, r.maximum_);
}

void BoundingRect::subtract(BoundingRegionBase const &region) {
    BoundingRect const r = RectAround(region);
    if (r.isEmpty())
        return;
    if (r.minimum_.x <= minimum_.x && maximum_.x <= r.maximum_.x)
        Trim(minimum_.y, maximum_.y, r.minimum_.y, r.maximum_.y);
    if (r.minimum_.y <= minimum_.y && maximum_.y <= r.maximum_.y)
        Trim(minimum_.x, maximum_.x, r.minimum_.x, r.maximum_.x);
}

void BoundingRect::dilate(BoundingRegionBase const &region) {
    BoundingRect const r = RectAround(region);
    if (r.isEmpty()) {
        makeNowhere();
        return;
    }
    minimum_ = Moved(minimum_, r.minimum_);
    maximum_ = Moved(maximum_, r.maximum_);
}

void BoundingRect::erode(BoundingRect const &r) {
    Vec const low(-r.minimum_.x, -r.minimum_.y);
    Vec const high(-r.maximum_.x, -r.maximum_.y);
    if (r.isEmpty())
        makeEverywhere();
    minimum_ = Moved(minimum_, low);
    maximum_ = Moved(maximum_, high);
}

void BoundingRect::translate(Vec const &d) {
    Vec const by = d; // which may be one of this rectangle's own bounds
    minimum_ = Moved(minimum_, by);
    maximum_ = Moved(maximum_, by);
}

std::vector<Vec> BoundingRect::convexHull() const {
    if (isEmpty())
        return {};
    return {minimum_, Vec(maximum_.x, minimum_.y), maximum_, Vec(minimum_.x, maximum_.y)};
}

BoundingRect BoundingRect::boundingRect() const {
    return *this;
}

BoundingRegionBase::Representation BoundingRect::representation() const {
    return REPRESENTATION_RECT;
}

std::string BoundingRect::toString() const {
    if (isEmpty())
        return "Empty";
    return ComposeText(minimum_.x, ", ", minimum_.y, "   ", maximum_.x, ", ", maximum_.y, "   ");
}

BoundingRect BoundingRect::RectFromHull(std::vector<Vec> const &hull) {
    BoundingRect rect;
    for (Vec const &p : hull)
        rect.include(p);
    return rect;
}

/// The rectangle around the hull of a region, nowhere for an empty one; made without the hull where
/// the region is a rectangle, since the hull allocates.
BoundingRect BoundingRect::RectAround(BoundingRegionBase const &region) {
    if (region.representation() != REPRESENTATION_RECT)
        return RectFromHull(region.convexHull());
    BoundingRect const rect = region.boundingRect();
    return rect.isEmpty() ? BoundingRect() : BoundingRect(rect.minimum_, rect.maximum_);
}

bool BoundingRect::ContainsNaN(Vec p) {
    return std::isnan(p.x) || std::isnan(p.y);
}

/// `bound` + `by`, but an infinite bound stays where it is when `by` is the opposite infinity:
/// their sum, a NaN, would bound nothing.
Vec BoundingRect::Moved(Vec const &bound, Vec const &by) {
    Vec sum(bound.x + by.x, bound.y + by.y);
    if (ContainsNaN(sum)) {
        if (std::isinf(bound.x) && std::isinf(by.x))
            sum.x = bound.x;
        if (std::isinf(bound.y) && std::isinf(by.y))
            sum.y = bound.y;
    }
    return sum;
}

bool operator==(BoundingRect const &a, BoundingRect const &b) {
    return a.minimum().x == b.minimum().x && a.minimum().y == b.minimum().y &&
           a.maximum().x == b.maximum().x && a.maximum().y == b.maximum().y;
}

bool operator!=(BoundingRect const &a, BoundingRect const &b) {
    return !(a == b);
}

} // namespace ORU
