// Local edits: round spots of more or less exposure.
#pragma once

#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/utility/integerrect.h"

#include <filesystem>
#include <iosfwd>
#include <vector>

namespace Develop {

/// Adds stops × (1 − smoothstep(0, radius, d)) to the exposure of a pixel whose centre is d pixels
/// from the spot's centre. (0, 0) is the upper left corner of the picture.
struct Spot {
    double x = 0;
    double y = 0;
    double radius = 0;
    double stops = 0;

    bool changesSomething() const { return radius > 0 && stops != 0; }
};

/// Reads a text with a spot on each line: centre x, centre y, radius, stops. A `#` begins a
/// comment.
/// @throws Failure, with the line's number, when a line is malformed
std::vector<Spot> ReadSpots(std::istream &text);

/// Reads a text file.
/// @throws Failure also when it cannot be opened
std::vector<Spot> ReadSpots(std::filesystem::path const &path);

/// Whether a spot can change pixels of an area; a few that cannot are let through.
bool Touches(Spot const &spot, ORU::IntegerRect const &area);

/// Where a spot can change a picture; nowhere when it changes nothing.
ORU::BoundingRect RegionOf(Spot const &spot);

} // namespace Develop
