// The parts of a picture that spots can change.
#pragma once

#include "apps/common/image.h"
#include "apps/develop/spots.h"

#include "oru/core/utility/integerrect.h"

#include <cstddef>
#include <vector>

namespace Develop {

/// Finds what spots can change, band by band.
class SpotAreas {
public:
    /// @param reach areas nearer to each other than twice this are one
    SpotAreas(std::vector<Spot> const &spots, App::Shape const &picture, std::size_t reach);

    /// The areas of a band that spots touch, beside each other; none where there is no spot.
    std::vector<ORU::IntegerRect> in(ORU::IntegerRect const &band) const;

private:
    std::vector<ORU::BoundingRect> regions_;
    std::size_t reach_;
};

} // namespace Develop
