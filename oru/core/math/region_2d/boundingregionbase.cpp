// The interface of conservative 2-D regions.
#include "oru/core/math/region_2d/boundingregionbase.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/math/region_2d/boundingrect.h"

#include <ostream>

namespace ORU {

using ambra::lumo::TVec2;

BoundingRegionBase::~BoundingRegionBase() = default;

void BoundingRegionBase::outset(TVec2<float> const &margin) {
    ORU_ASSERT_TEXT("vOutset.x >= 0.f && vOutset.y >= 0.f", margin.x >= 0 && margin.y >= 0);
    dilate(BoundingRect(TVec2<float>(-margin.x, -margin.y), margin));
}

void BoundingRegionBase::inset(TVec2<float> const &margin) {
    ORU_ASSERT_TEXT("vInset.x >= 0.f && vInset.y >= 0.f", margin.x >= 0 && margin.y >= 0);
    erode(BoundingRect(TVec2<float>(-margin.x, -margin.y), margin));
}

BoundingRegionBase::Representation BoundingRegionBase::representation() const {
    return REPRESENTATION_OTHER;
}

std::ostream &operator<<(std::ostream &os, BoundingRegionBase const &region) {
    return os << region.toString();
}

} // namespace ORU
