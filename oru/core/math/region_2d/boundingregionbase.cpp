// The interface of conservative 2-D regions.
#include "oru/core/math/region_2d/boundingregionbase.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/math/region_2d/boundingrect.h"

#include <ostream>

namespace ORU {

using ambra::lumo::TVec2;

BoundingRegionBase::~BoundingRegionBase() = default;

void BoundingRegionBase::outset(TVec2<float> const &vOutset) {
    ORU_ASSERT(vOutset.x >= 0.f && vOutset.y >= 0.f);
    dilate(BoundingRect(TVec2<float>(-vOutset.x, -vOutset.y), vOutset));
}

void BoundingRegionBase::inset(TVec2<float> const &vInset) {
    ORU_ASSERT(vInset.x >= 0.f && vInset.y >= 0.f);
    erode(BoundingRect(TVec2<float>(-vInset.x, -vInset.y), vInset));
}

BoundingRegionBase::Representation BoundingRegionBase::representation() const {
    return REPRESENTATION_OTHER;
}

std::ostream &operator<<(std::ostream &os, BoundingRegionBase const &region) {
    return os << region.toString();
}

} // namespace ORU
