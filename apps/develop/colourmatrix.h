// Light as three numbers, and its matrices.
#pragma once

#include "apps/common/picture.h"

#include <array>

namespace Develop {

/// Linear red, green and blue, or CIE X, Y and Z.
using Triple = std::array<double, 3>;

/// Linear light of one space in that of another: rows of a matrix.
using ColourMatrix = std::array<Triple, 3>;

/// The white that profiles connect colours by, CIE XYZ: ICC.1:2022, 7.2.16.
constexpr Triple kD50{0.9642, 1.0, 0.8249};

/// IEC 61966-2-1.
constexpr App::Primaries kSrgbPrimaries{
    {{0.3127, 0.3290}, {0.64, 0.33}, {0.30, 0.60}, {0.15, 0.06}}};

/// SMPTE EG 432-1, with the white of sRGB.
constexpr App::Primaries kDisplayP3Primaries{
    {{0.3127, 0.3290}, {0.680, 0.320}, {0.265, 0.690}, {0.150, 0.060}}};

Triple operator*(ColourMatrix const &matrix, Triple const &light);
ColourMatrix operator*(ColourMatrix const &a, ColourMatrix const &b);

/// @throws Failure when there is none, as the colours span no space
ColourMatrix Inverse(ColourMatrix const &matrix);

/// The matrix with its columns scaled such that all of them together are a certain white.
/// @throws Failure when there is none
ColourMatrix WithWhite(ColourMatrix const &matrix, Triple const &white);

/// Takes light of these primaries to CIE XYZ, adapted to D50.
/// @throws Failure when they span no colour space
ColourMatrix ToXyz(App::Primaries const &primaries);

} // namespace Develop
