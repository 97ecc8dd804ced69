// Files of spots, and the part of a picture that they change.
#include "fuzz/harness.h"

#include "apps/common/failure.h"
#include "apps/develop/areas.h"
#include "apps/develop/spots.h"

#include <cmath>
#include <limits>
#include <sstream>

namespace {

using Develop::Spot;

constexpr std::size_t kWidth = 40, kHeight = 24;

std::vector<Spot> Read(std::string const &text) {
    std::istringstream stream(text);
    return Develop::ReadSpots(stream);
}

std::string Written(std::vector<Spot> const &spots) {
    std::ostringstream text;
    text.precision(std::numeric_limits<double>::max_digits10);
    for (Spot const &spot : spots)
        text << spot.x << ' ' << spot.y << ' ' << spot.radius << '\t' << spot.stops << "#\n";
    return text.str();
}

bool Contains(ORU::IntegerRect const &area, std::size_t x, std::size_t y) {
    auto const column = static_cast<int>(x) - area.offset().x;
    auto const row = static_cast<int>(y) - area.offset().y;
    return column >= 0 && row >= 0 && static_cast<std::size_t>(column) < area.width() &&
           static_cast<std::size_t>(row) < area.height();
}

/// Whether the spot reaches the centre of a pixel.
bool Reaches(Spot const &spot, std::size_t x, std::size_t y) {
    return spot.changesSomething() &&
           std::hypot(static_cast<double>(x) + 0.5 - spot.x,
                      static_cast<double>(y) + 0.5 - spot.y) < spot.radius;
}

void FindAreas(std::vector<Spot> const &spots) {
    auto const areas = Develop::AreasOfSpots(spots, {1, 0.5}, {kWidth, kHeight, 3, 8});
    for (ORU::IntegerRect const &area : {areas.target, areas.source}) {
        HOLDS(area.offset().x >= 0 && area.offset().y >= 0);
        HOLDS(static_cast<std::size_t>(area.offset().x) + area.width() <= kWidth);
        HOLDS(static_cast<std::size_t>(area.offset().y) + area.height() <= kHeight);
    }
    for (std::size_t y = 0; y < kHeight; ++y)
        for (std::size_t x = 0; x < kWidth; ++x) {
            HOLDS(!Contains(areas.target, x, y) || Contains(areas.source, x, y));
            if (!Contains(areas.target, x, y))
                for (Spot const &spot : spots)
                    HOLDS(!Reaches(spot, x, y));
        }
}

} // namespace

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    std::vector<Spot> spots;
    try {
        spots = Read(fuzz::Text(data, size));
    } catch (App::Failure const &) {
        return 0;
    }
    for (Spot const &spot : spots)
        HOLDS(std::isfinite(spot.x + spot.y + spot.stops) && spot.radius >= 0);
    std::string const text = Written(spots);
    HOLDS(Written(Read(text)) == text);
    FindAreas(spots);
    return 0;
}
