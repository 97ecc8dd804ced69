// Light as three numbers, and its matrices.
#include "apps/develop/colourmatrix.h"

#include "apps/common/failure.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

namespace Develop {

namespace {

// What profiles and files tell of real primaries is far from this.
constexpr double kSmallestDeterminant = 1e-5;

// The adaptation that profiles are made with, linear Bradford: ICC.1:2022, annex E.
constexpr ColourMatrix kBradford{
    {{0.8951, 0.2664, -0.1614}, {-0.7502, 1.7135, 0.0367}, {0.0389, -0.0685, 1.0296}}};

ColourMatrix Diagonal(Triple const &values) {
    return {{{values[0], 0, 0}, {0, values[1], 0}, {0, 0, values[2]}}};
}

Triple FromChromaticity(std::array<double, 2> const &chromaticity) {
    auto const [x, y] = chromaticity;
    return {x / y, 1, (1 - x - y) / y};
}

ColourMatrix AdaptationFrom(Triple const &white) {
    Triple const from = kBradford * white;
    Triple const to = kBradford * kD50;
    return Inverse(kBradford) *
           (Diagonal({to[0] / from[0], to[1] / from[1], to[2] / from[2]}) * kBradford);
}

} // namespace

Triple operator*(ColourMatrix const &matrix, Triple const &light) {
    Triple result{};
    for (std::size_t row = 0; row < 3; ++row)
        for (std::size_t i = 0; i < 3; ++i)
            result[row] += matrix[row][i] * light[i];
    return result;
}

ColourMatrix operator*(ColourMatrix const &a, ColourMatrix const &b) {
    ColourMatrix result{};
    for (std::size_t row = 0; row < 3; ++row)
        for (std::size_t column = 0; column < 3; ++column)
            for (std::size_t i = 0; i < 3; ++i)
                result[row][column] += a[row][i] * b[i][column];
    return result;
}

ColourMatrix Inverse(ColourMatrix const &matrix) {
    ColourMatrix adjugate{};
    for (std::size_t row = 0; row < 3; ++row)
        for (std::size_t column = 0; column < 3; ++column) {
            std::size_t const r1 = (row + 1) % 3, r2 = (row + 2) % 3;
            std::size_t const c1 = (column + 1) % 3, c2 = (column + 2) % 3;
            adjugate[column][row] =
                matrix[r1][c1] * matrix[r2][c2] - matrix[r1][c2] * matrix[r2][c1];
        }
    double determinant = 0;
    for (std::size_t i = 0; i < 3; ++i)
        determinant += matrix[0][i] * adjugate[i][0];
    if (!(std::isfinite(determinant) && std::abs(determinant) > kSmallestDeterminant))
        throw App::Failure("has primaries that span no colours");
    for (Triple &row : adjugate)
        for (double &value : row)
            value /= determinant;
    return adjugate;
}

ColourMatrix WithWhite(ColourMatrix const &matrix, Triple const &white) {
    Triple const scales = Inverse(matrix) * white;
    if (!(*std::min_element(scales.begin(), scales.end()) > 0))
        throw App::Failure("has a white outside its colours");
    return matrix * Diagonal(scales);
}

ColourMatrix ToXyz(App::Primaries const &primaries) {
    ColourMatrix colours{};
    for (std::size_t column = 0; column < 3; ++column) {
        Triple const colour = FromChromaticity(primaries[column + 1]);
        for (std::size_t row = 0; row < 3; ++row)
            colours[row][column] = colour[row];
    }
    Triple const white = FromChromaticity(primaries[0]);
    return WithWhite(AdaptationFrom(white) * WithWhite(colours, white), kD50);
}

} // namespace Develop
