// Tables between the codes of a picture and linear light.
#pragma once

#include "apps/common/image.h"
#include "apps/develop/colourspace.h"

#include <cstddef>
#include <cstdint>
#include <vector>

namespace Develop {

/// How the codes of a kind of picture become light, and light those of the developed picture. Where
/// there are several curves, their tables follow each other.
struct CodeTables {
    /// @param from, to colour spaces of the picture and of the developed one
    CodeTables(ColourSpace const &from, ColourSpace const &to, App::Shape const &shape);

    std::size_t curves; ///< 1 that all channels share, or one for each colour
    std::size_t levels; ///< entries of a curve

    /// Of every code; of floats at equal distances from 0 to 1.
    std::vector<float> lights;

    /// The light where one code ends and the next begins, at last infinity: the nearest code of a
    /// light is the number of thresholds that it reaches. For floats lights as above.
    std::vector<float> thresholds;

    /// How many thresholds are reached for certain by a light whose root, in terms of
    /// `indices` - 1, is not below the entry's place. At most `steps` more are. Empty for floats.
    std::vector<std::uint16_t> index;
    std::size_t indices;
    std::size_t steps;

    /// Whether floats are the light itself, in the picture and in the developed one.
    bool isLinear;
    bool becomesLinear;
};

} // namespace Develop
