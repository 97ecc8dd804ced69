// Files of spots, and the parts of a picture that they change.
#include "fuzz/harness.h"

#include "apps/common/failure.h"
#include "apps/develop/bandplan.h"
#include "apps/develop/spotareas.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <sstream>

namespace {

using Develop::Spot;

constexpr std::size_t kWidth = 40, kHeight = 24, kBand = 8;

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
    Develop::SpotAreas const areas(spots, {kWidth, kHeight, 3, 8}, 2);
    for (std::size_t top = 0; top < kHeight; top += kBand) {
        auto const found = areas.in(Develop::PixelRect(0, top, kWidth, kBand));
        for (ORU::IntegerRect const &area : found)
            HOLDS(area.offset().x >= 0 && area.offset().y >= static_cast<int>(top) &&
                  static_cast<std::size_t>(area.offset().x) + area.width() <= kWidth &&
                  static_cast<std::size_t>(area.offset().y) + area.height() <= top + kBand);
        for (std::size_t y = top; y < top + kBand; ++y)
            for (std::size_t x = 0; x < kWidth; ++x) {
                auto const times =
                    std::count_if(found.begin(), found.end(), [=](ORU::IntegerRect const &area) {
                        return Contains(area, x, y);
                    });
                HOLDS(times <= 1);
                if (times == 0)
                    for (Spot const &spot : spots)
                        HOLDS(!Reaches(spot, x, y));
            }
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
