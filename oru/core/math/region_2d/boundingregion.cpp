// A region held by value, whatever its kind.
#include "oru/core/math/region_2d/boundingregion.h"

#include "oru/core/math/region_2d/boundingrect.h"

namespace ORU {

using ambra::lumo::TVec2;

BoundingRegion::BoundingRegion(TVec2<float> const &a, TVec2<float> const &b)
    : BoundingRegion(BoundingRect(a, b)) {}

BoundingRegion::BoundingRegion(BoundingRect const &rect) : region_(rect.clone()) {}

BoundingRegion::BoundingRegion(BoundingRegion const &other)
    : BoundingRegionBase(other), region_(other.region_ ? other.region_->clone() : nullptr) {}

BoundingRegion &BoundingRegion::operator=(BoundingRegion const &other) {
    if (this != &other) {
        region_.reset();
        if (other.region_)
            region_.reset(other.region_->clone());
    }
    return *this;
}

BoundingRegion::~BoundingRegion() = default;

BoundingRegion *BoundingRegion::clone() const {
    return ORU_NEW BoundingRegion(*this);
}

bool BoundingRegion::isEmpty() const {
    return !region_ || region_->isEmpty();
}

void BoundingRegion::makeNowhere() {
    region_.reset();
}

void BoundingRegion::makeEverywhere() {
    internalRegion().makeEverywhere();
}

void BoundingRegion::include(BoundingRegionBase const &region) {
    internalRegion().include(region);
}

void BoundingRegion::include(TVec2<float> const &p) {
    internalRegion().include(p);
}

bool BoundingRegion::contains(BoundingRegionBase const &region) const {
    return region_ && region_->contains(region);
}

bool BoundingRegion::contains(TVec2<float> const &p) const {
    return region_ && region_->contains(p);
}

void BoundingRegion::intersect(BoundingRegionBase const &region) {
    internalRegion().intersect(region);
}

void BoundingRegion::subtract(BoundingRegionBase const &region) {
    internalRegion().subtract(region);
}

void BoundingRegion::dilate(BoundingRegionBase const &region) {
    internalRegion().dilate(region);
}

void BoundingRegion::erode(BoundingRect const &r) {
    internalRegion().erode(r);
}

void BoundingRegion::translate(TVec2<float> const &d) {
    internalRegion().translate(d);
}

std::vector<TVec2<float>> BoundingRegion::convexHull() const {
    return region_ ? region_->convexHull() : std::vector<TVec2<float>>();
}

BoundingRect BoundingRegion::boundingRect() const {
    return region_ ? region_->boundingRect() : BoundingRect();
}

BoundingRegionBase::Representation BoundingRegion::representation() const {
    return region_ ? region_->representation() : REPRESENTATION_OTHER;
}

std::string BoundingRegion::toString() const {
    return region_ ? region_->toString() : "[]";
}

BoundingRegionBase &BoundingRegion::internalRegion() {
    if (!region_)
        region_.reset(ORU_NEW BoundingRect);
    return *region_;
}

bool operator==(BoundingRegion const &a, BoundingRegion const &b) {
    if (a.isEmpty() && b.isEmpty())
        return true;
    return a.contains(b) && b.contains(a);
}

bool operator!=(BoundingRegion const &a, BoundingRegion const &b) {
    return !(a == b);
}

} // namespace ORU
