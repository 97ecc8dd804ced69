// What ICC profiles say of the pictures that they lie in.
#pragma once

#include "apps/common/picture.h"
#include "apps/develop/colourmatrix.h"
#include "apps/develop/tonecurve.h"

#include <string>
#include <vector>

namespace Develop {

/// What a profile of a grey or RGB picture says.
struct IccProfile {
    std::string name;                ///< printable ASCII
    std::vector<StoredCurve> curves; ///< one of grey, or three of red, green and blue
    bool isOfTables = false;         ///< which the curve of its greys stands for
    ColourMatrix toXyz{};            ///< D50; of an RGB profile
};

/// @param channels of colour: 1 or 3
/// @throws Failure when it is damaged, or not for pictures of so many channels
IccProfile ReadIccProfile(App::Bytes const &bytes, std::size_t channels);

/// A profile whose bytes depend on the arguments alone.
/// @param channels of colour: 1 or 3, for a grey or an RGB profile
/// @param curve a function
App::Bytes WriteIccProfile(std::string const &name, std::size_t channels, StoredCurve const &curve,
                           App::Primaries const &primaries);

} // namespace Develop
