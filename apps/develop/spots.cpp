// Local edits: round spots of more or less exposure.
#include "apps/develop/spots.h"

#include "apps/common/failure.h"

#include "oru/core/math/region_2d/boundingrect.h"

#include <cmath>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>

namespace Develop {

using ambra::lumo::TVec2;
using ORU::BoundingRect;
using ORU::BoundingRegion;
using ORU::IntegerRect;

namespace {

// Floats hold coordinates exactly enough up to here, and no picture is larger.
constexpr double cMaxCoordinate = 1e7;
constexpr double cMaxStops = 100;

double Number(std::string const &word, double limit) {
    char *end = nullptr;
    double const value = std::strtod(word.c_str(), &end);
    if (end != word.c_str() + word.size() || !std::isfinite(value))
        throw App::Failure("'" + word + "' is not a number");
    if (std::abs(value) > limit)
        throw App::Failure(word + " is out of range");
    return value;
}

Spot ParseSpot(std::vector<std::string> const &words) {
    if (words.size() != 4)
        throw App::Failure("4 numbers are needed: centre x, centre y, radius, exposure");
    Spot const spot{Number(words[0], cMaxCoordinate), Number(words[1], cMaxCoordinate),
                    Number(words[2], cMaxCoordinate), Number(words[3], cMaxStops)};
    if (spot.radius < 0)
        throw App::Failure("the radius is negative");
    return spot;
}

std::vector<std::string> Words(std::string const &line) {
    std::istringstream text(line.substr(0, line.find('#')));
    std::vector<std::string> words;
    for (std::string word; text >> word;)
        words.push_back(word);
    return words;
}

TVec2<float> Point(double x, double y) {
    return TVec2<float>(static_cast<float>(x), static_cast<float>(y));
}

BoundingRect Square(double reach) {
    return BoundingRect(Point(-reach, -reach), Point(reach, reach));
}

} // namespace

std::vector<Spot> ReadSpots(std::filesystem::path const &path) {
    std::error_code error;
    std::ifstream file(path);
    if (!file || std::filesystem::is_directory(path, error))
        throw App::Failure("cannot be opened");
    std::vector<Spot> spots;
    std::size_t number = 0;
    for (std::string line; std::getline(file, line);) {
        ++number;
        std::vector<std::string> const words = Words(line);
        if (words.empty())
            continue;
        try {
            spots.push_back(ParseSpot(words));
        } catch (App::Failure const &failure) {
            throw App::Failure("line " + std::to_string(number) + ": " + failure.what());
        }
    }
    return spots;
}

BoundingRegion RegionOf(std::vector<Spot> const &spots) {
    BoundingRegion region;
    for (Spot const &spot : spots)
        if (spot.changesSomething())
            region.include(BoundingRect(Point(spot.x - spot.radius, spot.y - spot.radius),
                                        Point(spot.x + spot.radius, spot.y + spot.radius)));
    region.dilate(Square(1)); // covers what the floats were rounded by
    return region;
}

IntegerRect Frame(std::size_t width, std::size_t height) {
    return IntegerRect(TVec2<int>(0, 0), ORU::size2(width, height));
}

IntegerRect PixelsAround(BoundingRegion region, std::size_t reach, IntegerRect const &frame) {
    region.dilate(Square(static_cast<double>(reach)));
    TVec2<int> const corner = frame.offset();
    region.intersect(BoundingRect(Point(corner.x, corner.y),
                                  Point(corner.x + static_cast<double>(frame.width()),
                                        corner.y + static_cast<double>(frame.height()))));
    if (region.isEmpty())
        return IntegerRect();
    BoundingRect const bounds = region.boundingRect();
    TVec2<int> const first(static_cast<int>(std::floor(bounds.minimum().x)),
                           static_cast<int>(std::floor(bounds.minimum().y)));
    TVec2<int> const end(static_cast<int>(std::ceil(bounds.maximum().x)),
                         static_cast<int>(std::ceil(bounds.maximum().y)));
    return IntegerRect(first, ORU::size2(static_cast<std::size_t>(end.x - first.x),
                                         static_cast<std::size_t>(end.y - first.y)));
}

} // namespace Develop
