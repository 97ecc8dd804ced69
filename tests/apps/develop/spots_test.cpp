// The local edits of develop: exact, and the same when only their region is computed.
#include "apps/develop/spots.h"
#include "tests/apps/develop/developfixture.h"
#include "tests/support/failure.h"

#include <map>

using namespace apps_test;
using App::Image;
using Develop::Spot;

namespace {

using Spots = DevelopFixture;

/// The light of a picture brightened everywhere and at its spots, by index.
auto SpottedLight(Image const &photo, std::vector<Spot> const &spots, double stops) {
    return [&photo, spots, stops](std::size_t i) {
        std::size_t const pixel = i / photo.channels;
        std::size_t const row = pixel / photo.width;
        double const x = static_cast<double>(pixel % photo.width) + 0.5;
        double const y = static_cast<double>(row) + 0.5;
        double sum = stops;
        for (Spot const &spot : spots) {
            double const d = std::hypot(x - spot.x, y - spot.y);
            double const t = spot.radius > 0 ? std::min(d / spot.radius, 1.0) : 1.0;
            sum += spot.stops * (1 - t * t * (3 - 2 * t));
        }
        return Light(photo, i) * std::exp2(sum);
    };
}

std::vector<std::string> SpotFiles() {
    std::vector<std::string> files = {
        "30 20 12 1\n 36 22 9.5 -2\n 31 20 3 4", // overlapping
        "90 30 11 -1\n 45 61 7 3\n 30.5 20.5 0 5\n 50.5 40.5 1e-6 3\n 89.5 60.5 0.4 -8",
        "-40 20 50 2\n 45 -1000 1010.5 1\n 500 500 20 9", "-100 -100 50 2"};
    std::mt19937 random(7);
    std::uniform_real_distribution<double> x(-5, 60), y(-5, 50), radius(0, 6), stops(-1, 1);
    std::ostringstream thousands;
    for (int i = 0; i < 5000; ++i)
        thousands << x(random) << ' ' << y(random) << ' ' << radius(random) << ' ' << stops(random)
                  << '\n';
    files.push_back(thousands.str());
    return files;
}

// The full frame is exact, and computing the region over a base gives the same bytes, also where
// sharpening, on OpenCL and on OpenGL, reaches into the region from around it.
TEST_F(Spots, AreExactAndTheSameOverABase) {
    static std::string const kPhoto = "Blüte – 花 ✿.png";
    std::pair<App::Shape, std::string> const cases[] = {
        {{91, 62, 4, 16}, ""},
        {{91, 62, 3, 8}, "--sharpen 1.5 --radius 9"},
        {{91, 62, 3, 16}, "--sharpen 1.5 --radius 9 --device none"}};
    for (auto const &[shape, sharpening] : cases) {
        Image const photo = RandomPicture(shape, 1);
        write(kPhoto, photo);
        auto const run = [this, options = sharpening](std::string const &more) {
            return tellsOf(options + " --exposure 0.3 --report \"" + kPhoto + "\" --output " +
                           more);
        };
        EXPECT_THAT(run("base"), testing::HasSubstr(kPhoto + " -> base/" + kPhoto + " ("));
        for (std::string const &spots : SpotFiles()) {
            SCOPED_TRACE(shape.description() + sharpening + ", spots " + spots.substr(0, 40));
            write("spots", spots);
            run("full --spots spots");
            EXPECT_THAT(run("local --spots spots --base \"base/" + kPhoto + "\""),
                        testing::HasSubstr("pixels processed: "));
            Image const full = read("full/" + kPhoto);
            EXPECT_EQ(full.pixels, read("local/" + kPhoto).pixels);
            auto const exact = SpottedLight(photo, Develop::ReadSpots(path("spots")), 0.3);
            if (sharpening.empty()) {
                EXPECT_LE(WorstError(photo, full, exact), Tolerance(photo));
            }
        }
    }
}

TEST_F(Spots, Texts) {
    auto const parse = [this](std::string const &text) {
        write("spots", text);
        return Develop::ReadSpots(path("spots"));
    };
    std::vector<Spot> const spots =
        parse("# a face\r\n\r\n\t 30.5  +2e1\t12 -1 # brighter\n   \n#");
    ASSERT_EQ(spots.size(), 1u);
    EXPECT_EQ(spots[0].y, 20);
    EXPECT_EQ(spots[0].stops, -1);
    std::map<std::string, std::string> const reasons = {
        {"1 2 3", "4 numbers are needed: centre x, centre y, radius, exposure"},
        {"nan 2 3 4", "'nan' is not a number"},
        {"1e300 2 3 4", "1e300 is out of range"}};
    for (auto const &row : reasons)
        EXPECT_FAILURE("line 3: " + row.second, parse("1 2 3 1\n# fine\n" + row.first + "\n1 2\n"));
}

} // namespace
