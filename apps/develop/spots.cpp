// Local edits: round spots of more or less exposure.
#include "apps/develop/spots.h"

#include "apps/common/failure.h"
#include "apps/common/number.h"

#include <cmath>
#include <fstream>
#include <optional>
#include <sstream>
#include <string>

namespace Develop {

using ambra::lumo::TVec2;
using ORU::BoundingRect;

namespace {

// Floats hold coordinates exactly enough up to here, and no picture is larger.
constexpr double kMaxCoordinate = 1e7;
constexpr double kMaxStops = 100;

double Number(std::string const &word, double limit) {
    std::optional<double> const value = App::ParseNumber(word);
    if (!value)
        throw App::Failure("'" + word + "' is not a number");
    if (std::abs(*value) > limit)
        throw App::Failure(word + " is out of range");
    return *value;
}

Spot ParseSpot(std::vector<std::string> const &words) {
    if (words.size() != 4)
        throw App::Failure("4 numbers are needed: centre x, centre y, radius, exposure");
    Spot const spot{Number(words[0], kMaxCoordinate), Number(words[1], kMaxCoordinate),
                    Number(words[2], kMaxCoordinate), Number(words[3], kMaxStops)};
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

} // namespace

std::vector<Spot> ReadSpots(std::istream &text) {
    std::vector<Spot> spots;
    std::size_t number = 0;
    for (std::string line; std::getline(text, line);) {
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

std::vector<Spot> ReadSpots(std::filesystem::path const &path) {
    std::error_code error;
    std::ifstream file(path);
    if (!file || std::filesystem::is_directory(path, error))
        throw App::Failure("cannot be opened");
    return ReadSpots(file);
}

bool Touches(Spot const &spot, ORU::IntegerRect const &area) {
    auto const meets = [reach = spot.radius + 2](double centre, int first, std::size_t size) {
        return centre + reach >= first && centre - reach <= first + static_cast<double>(size);
    };
    return spot.changesSomething() && meets(spot.x, area.offset().x, area.width()) &&
           meets(spot.y, area.offset().y, area.height());
}

BoundingRect RegionOf(Spot const &spot) {
    if (!spot.changesSomething())
        return BoundingRect();
    BoundingRect region(Point(spot.x - spot.radius, spot.y - spot.radius),
                        Point(spot.x + spot.radius, spot.y + spot.radius));
    region.outset(TVec2<float>(1, 1)); // what the floats were rounded by
    return region;
}

} // namespace Develop
