// The parts of a picture that developing works on.
#pragma once

#include "apps/common/image.h"
#include "apps/develop/sharpener.h"
#include "apps/develop/spots.h"

#include "oru/core/utility/integerrect.h"

#include <vector>

namespace Develop {

/// What is developed, and what that needs.
struct Areas {
    ORU::IntegerRect target; ///< the pixels to compute
    ORU::IntegerRect source; ///< the pixels that they depend on, these among them
};

/// All of a picture.
Areas WholePicture(App::Shape const &picture);

/// What spots can change, and what developing it reads around it; both empty when that is nothing.
Areas AreasOfSpots(std::vector<Spot> const &spots, Sharpening const &sharpening,
                   App::Shape const &picture);

} // namespace Develop
