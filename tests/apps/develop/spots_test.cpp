// The local edits of develop: exact, and the same when only their region is computed.
#include "apps/common/offscreengpu.h"
#include "apps/develop/choosesharpener.h"
#include "apps/develop/developer.h"
#include "apps/develop/openclruntime.h"
#include "tests/apps/develop/developfixture.h"
#include "tests/support/failure.h"

#include <map>
#include <random>

using namespace apps_test;
using App::Image;

namespace {

using Develop::Spot;
using SpotList = std::vector<Spot>;

/// The light of a picture brightened everywhere and at its spots, by index.
auto SpottedLight(Image const &photo, SpotList const &spots, double stops) {
    return [&photo, &spots, stops](std::size_t i) {
        std::size_t const pixel = i / photo.channels;
        double const x = static_cast<double>(pixel % photo.width) + 0.5;
        double const y = static_cast<double>(pixel / photo.width) + 0.5;
        double sum = stops;
        for (Spot const &spot : spots) {
            double const d = std::hypot(x - spot.x, y - spot.y);
            double const t = spot.radius > 0 ? std::min(d / spot.radius, 1.0) : 1.0;
            sum += spot.stops * (1 - t * t * (3 - 2 * t));
        }
        return Light(photo, i) * std::exp2(sum);
    };
}

std::map<std::string, SpotList> SpotSets() {
    std::map<std::string, SpotList> sets = {
        {"overlapping", {{30, 20, 12, 1}, {36, 22, 9.5, -2}, {31, 20, 3, 4}}},
        {"edges", {{0, 0, 9, 2}, {90, 30, 11, -1}, {45, 61, 7, 3}}},
        {"outside", {{-40, 20, 50, 2}, {45, -1000, 1010.5, 1}, {500, 500, 20, 9}}},
        {"nowhere", {{-100, -100, 50, 2}}},
        {"tiny", {{30.5, 20.5, 0, 5}, {50.5, 20.5, 1e-6, 3}, {89.5, 60.5, 0.4, -8}}}};
    std::mt19937 random(7);
    std::uniform_real_distribution<double> x(-5, 60), y(-5, 50), radius(0, 6), stops(-1, 1);
    for (int i = 0; i < 5000; ++i)
        sets["thousands"].push_back(Spot{x(random), y(random), radius(random), stops(random)});
    return sets;
}

/// The stages of the program on a context of their own.
class SpotRegions : public ::testing::Test {
protected:
    Image develop(Image const &photo, Develop::Areas const &areas, Develop::Recipe const &recipe) {
        developer_->upload(photo, areas);
        developer_->sharpen(recipe);
        developer_->develop(recipe);
        return developer_->readBack();
    }

    /// The full frame, and the base with the region of the spots put over it.
    std::pair<Image, Image> developBothWays(Image const &photo, Develop::Recipe recipe) {
        Develop::Areas const whole = Develop::WholePicture(photo);
        Image const full = develop(photo, whole, recipe);
        Develop::Areas const areas = Develop::AreasOfSpots(recipe.spots, recipe.sharpening, photo);
        ORU::IntegerRect const &area = areas.target;
        Image const part = area.isEmpty() ? Image() : develop(photo, areas, recipe);
        recipe.spots.clear();
        Image base = develop(photo, whole, recipe);
        for (std::size_t y = 0; y < part.height; ++y)
            std::copy_n(part.row(y), part.rowBytes(),
                        base.row(y + static_cast<std::size_t>(area.offset().y)) +
                            static_cast<std::size_t>(area.offset().x) * base.bytesPerPixel());
        return {full, base};
    }

    void useDevice(std::string const &wish) {
        developer_ = std::make_unique<Develop::Developer>(
            Develop::ChooseSharpener(runtime_, wish, gpu_.context()));
    }

private:
    Develop::OpenCLRuntime const runtime_{std::string()};
    App::OffscreenGpu const gpu_{std::string()};
    std::unique_ptr<Develop::Developer> developer_;
};

// The full frame is exact, and computing the region over a base gives the same bytes, also where
// sharpening, on OpenCL and on OpenGL, reaches into the region from around it.
TEST_F(SpotRegions, EqualFullFrame) {
    struct Case {
        std::string device;
        App::Shape shape;
        Develop::Sharpening sharpening;
    };
    App::Shape const usual = {91, 62, 3, 16};
    Case const cases[] = {{"none", {91, 62, 3, 8}, {}}, {"none", {33, 80, 4, 16}, {}},
                          {"none", {64, 1, 1, 8}, {}},  {"none", usual, {1.5, 0.3}},
                          {"none", usual, {1.5, 9.0}},  {"", usual, {1.5, 0.3}},
                          {"", usual, {1.5, 9.0}}};
    for (auto const &[device, shape, sharpening] : cases) {
        useDevice(device);
        Image const photo = RandomPicture(shape, 1);
        for (auto const &[name, spots] : SpotSets()) {
            SCOPED_TRACE(name + ", " + shape.description() + ", " + device);
            auto const [full, local] = developBothWays(photo, {0.3, sharpening, spots});
            EXPECT_EQ(full.pixels, local.pixels) << "sigma " << sharpening.sigma;
            if (!sharpening.isOn()) {
                EXPECT_LE(WorstError(photo, full, SpottedLight(photo, spots, 0.3)),
                          Tolerance(photo));
            }
        }
    }
}

using Spots = DevelopFixture;

// The program does the same with files, and tells how little it computed.
TEST_F(Spots, BaseAndFullFrame) {
    write("photo.png", RandomPicture({100, 50, 3, 16}, 1));
    write("spots.txt", "20 20 4 1");
    tellsOf("--sharpen 1 --output base photo.png");
    tellsOf("--sharpen 1 --output full --spots spots.txt photo.png");
    std::string const text = tellsOf("--sharpen 1 --output local --spots spots.txt --base "
                                     "base/photo.png --report photo.png");
    EXPECT_EQ(read("full/photo.png").pixels, read("local/photo.png").pixels);
    EXPECT_NE(read("full/photo.png").pixels, read("base/photo.png").pixels);
    EXPECT_THAT(text, testing::HasSubstr("pixels processed: 2.00 %"));
    EXPECT_THAT(text, testing::HasSubstr("the full frame takes "));
}

TEST_F(Spots, Texts) {
    auto const parse = [this](std::string const &text) {
        write("spots", text);
        return Develop::ReadSpots(path("spots"));
    };
    SpotList const spots = parse("# a face\r\n\r\n\t 30.5  +2e1\t12 -1 # brighter\n   \n#");
    ASSERT_EQ(spots.size(), 1u);
    EXPECT_EQ(spots[0].y, 20);
    EXPECT_EQ(spots[0].stops, -1);
    std::map<std::string, std::string> const reasons = {
        {"1 2 3", "4 numbers are needed: centre x, centre y, radius, exposure"},
        {"nan 2 3 4", "'nan' is not a number"},
        {"1 2 3 4,", "'4,' is not a number"},
        {"1 2 -3 4", "the radius is negative"},
        {"1e300 2 3 4", "1e300 is out of range"}};
    for (auto const &row : reasons)
        EXPECT_FAILURE("line 3: " + row.second, parse("1 2 3 1\n# fine\n" + row.first + "\n1 2\n"));
}

} // namespace
