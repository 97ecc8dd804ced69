// The local edits of develop: exact, and the same when only their region is computed.
#include "apps/common/offscreengpu.h"
#include "apps/develop/choosesharpener.h"
#include "apps/develop/developer.h"
#include "apps/develop/openclruntime.h"
#include "tests/apps/develop/developfixture.h"
#include "tests/support/pictures.h"

#include <map>
#include <random>
#include <sstream>

using namespace apps_test;
using App::Image;

namespace {

using Develop::Spot;
using SpotList = std::vector<Spot>;

double StopsAt(SpotList const &spots, double x, double y) {
    double sum = 0;
    for (Spot const &spot : spots) {
        double const d = std::hypot(x - spot.x, y - spot.y);
        double const t = spot.radius > 0 ? std::min(d / spot.radius, 1.0) : 1.0;
        sum += spot.stops * (1 - t * t * (3 - 2 * t));
    }
    return sum;
}

double WorstSpotError(Image const &original, Image const &developed, SpotList const &spots,
                      double stops) {
    double worst = 0;
    for (std::size_t i = 0; i < ValueCount(original); ++i) {
        std::size_t const pixel = i / original.channels;
        double const x = static_cast<double>(pixel % original.width) + 0.5;
        std::size_t const row = pixel / original.width;
        double const y = static_cast<double>(row) + 0.5;
        double const exact =
            IsAlpha(original, i)
                ? Value(original, i)
                : Developed(Value(original, i), stops + StopsAt(spots, x, y), Levels(original));
        worst = std::max(worst, std::abs(exact - Value(developed, i)));
    }
    return worst;
}

std::map<std::string, SpotList> SpotSets() {
    std::map<std::string, SpotList> sets = {
        {"one", {{30.25, 20.5, 12, 1.5}}},
        {"overlapping", {{30, 20, 12, 1}, {36, 22, 9.5, -2}, {31, 20, 3, 4}}},
        {"edges", {{0, 0, 9, 2}, {90, 30, 11, -1}, {45, 61, 7, 3}}},
        {"outside", {{-40, 20, 50, 2}, {45, -1000, 1010.5, 1}, {500, 500, 20, 9}}},
        {"nowhere", {{-100, -100, 50, 2}}},
        {"zero radius", {{30.5, 20.5, 0, 5}, {50, 20, 4, 1}}},
        {"tiny", {{30.5, 20.5, 1e-6, 3}, {89.5, 60.5, 0.4, -8}}},
        {"nothing", {{30, 20, 10, 0}}}};
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

// The full frame is exact, and computing the region over a base gives the same bytes.
TEST_F(SpotRegions, EqualFullFrame) {
    useDevice("none");
    for (App::Shape const &shape :
         std::vector<App::Shape>{{91, 62, 3, 8}, {91, 62, 2, 16}, {33, 80, 4, 16}, {64, 1, 1, 8}}) {
        Image const photo = RandomPicture(shape, 1);
        for (auto const &[name, spots] : SpotSets()) {
            auto const [full, local] = developBothWays(photo, {0.3, {}, spots});
            EXPECT_EQ(full.pixels, local.pixels) << name;
            EXPECT_LE(WorstSpotError(photo, full, spots, 0.3), Tolerance(photo))
                << name << ", " << shape.description();
        }
    }
}

// Sharpening reaches into the region from around it, on OpenCL and on OpenGL.
TEST_F(SpotRegions, EqualFullFrameWhenSharpened) {
    Image const photo = RandomPicture({91, 62, 3, 16}, 1);
    for (char const *const device : {"", "none"}) {
        useDevice(device);
        for (double const sigma : {0.3, 1.7, 9.0})
            for (auto const &[name, spots] : SpotSets()) {
                auto const [full, local] = developBothWays(photo, {-0.2, {1.5, sigma}, spots});
                EXPECT_EQ(full.pixels, local.pixels) << name << ", sigma " << sigma;
            }
    }
}

class Spots : public DevelopFixture {
protected:
    void writeText(std::string const &name, std::string const &text) {
        write(name, std::vector<unsigned char>(text.begin(), text.end()));
    }

    void writeSpots(std::string const &name, SpotList const &spots) {
        std::ostringstream text;
        text.precision(17);
        for (Spot const &spot : spots)
            text << spot.x << " " << spot.y << " " << spot.radius << " " << spot.stops << "\n";
        writeText(name, text.str());
    }

    std::vector<unsigned char> develop(std::string const &output,
                                       std::vector<std::string> arguments) {
        for (char const *const argument : {"--exposure", "0.3", "--quiet", "--output"})
            arguments.emplace_back(argument);
        arguments.push_back(output);
        arguments.push_back("photo.png");
        Outcome const outcome = DevelopFixture::develop(arguments);
        EXPECT_EQ(outcome.exitCode, 0) << outcome.errors;
        return read(output + "/photo.png").pixels;
    }
};

// The program does the same with files.
TEST_F(Spots, BaseAndFullFrame) {
    write("photo.png", RandomPicture({91, 62, 3, 8}, 1));
    writeSpots("spots.txt", SpotSets().at("overlapping"));
    develop("base", {"--sharpen", "1"});
    auto const full = develop("full", {"--sharpen", "1", "--spots", "spots.txt"});
    EXPECT_EQ(full, develop("local", {"--sharpen", "1", "--spots", "spots.txt", "--base",
                                      "base/photo.png"}));
    EXPECT_NE(full, read("base/photo.png").pixels);
}

TEST_F(Spots, TextForms) {
    write("photo.png", RandomPicture({91, 62, 3, 8}, 1));
    writeSpots("plain.txt", {{30.5, 20, 12, 1}});
    writeText("odd.txt", "# a face\r\n\r\n\t 30.5  +2e1\t12 1 # brighter\n   \n#");
    EXPECT_EQ(develop("a", {"--spots", "plain.txt"}), develop("b", {"--spots", "odd.txt"}));
}

TEST_F(Spots, MalformedLines) {
    write("photo.png", RandomPicture({9, 6, 3, 8}, 1));
    std::map<std::string, std::string> const reasons = {
        {"1 2 3", "4 numbers are needed"},  {"1 2 3 4 5", "4 numbers are needed"},
        {"1 2 x 4", "'x' is not a number"}, {"1 2 3 4,", "'4,' is not a number"},
        {"1 2 -3 4", "radius is negative"}, {"nan 2 3 4", "'nan' is not a number"},
        {"1e300 2 3 4", "out of range"}};
    for (auto const &[line, reason] : reasons) {
        writeText("spots.txt", "1 2 3 1\n# fine so far\n" + line + "\n1 2 3\n");
        Outcome const outcome = DevelopFixture::develop({"--spots", "spots.txt", "photo.png"});
        EXPECT_EQ(outcome.exitCode, 1);
        EXPECT_EQ(outcome.errorLines().size(), 1u) << outcome.errors;
        EXPECT_TRUE(Reports(outcome, "spots.txt: line 3", reason));
    }
    EXPECT_FALSE(std::filesystem::exists(path("out")));
}

TEST_F(Spots, BadBase) {
    write("photo.png", RandomPicture({9, 6, 3, 8}, 1));
    write("other.png", RandomPicture({9, 7, 3, 8}, 1));
    writeSpots("spots.txt", {{3, 3, 2, 1}});
    auto const outcomeOf = [this](std::vector<std::string> arguments) {
        arguments.insert(arguments.begin(), {"--spots", "spots.txt", "--base"});
        return DevelopFixture::develop(arguments);
    };
    EXPECT_TRUE(Reports(outcomeOf({"other.png", "photo.png"}), "photo.png",
                        "its base other.png: is 9 x 7, RGB, 8 bit, not 9 x 6, RGB, 8 bit"));
    EXPECT_TRUE(
        Reports(outcomeOf({"none.png", "photo.png"}), "photo.png", "none.png: no such file"));
    EXPECT_TRUE(Reports(outcomeOf({"other.png", "photo.png", "other.png"}), "other.png",
                        "base of one picture only"));
    EXPECT_TRUE(Reports(outcomeOf({"out/photo.png", "photo.png"}), "photo.png", "would replace"));
}

TEST_F(Spots, ReportTellsTheShare) {
    write("photo.png", RandomPicture({100, 50, 3, 8}, 1));
    writeSpots("spots.txt", {{20, 20, 4, 1}});
    develop("base", {});
    Outcome const outcome = DevelopFixture::develop(
        {"--spots", "spots.txt", "--base", "base/photo.png", "--report", "photo.png"});
    EXPECT_NE(outcome.output.find("pixels processed: 2.00 %"), std::string::npos) << outcome.output;
    EXPECT_NE(outcome.output.find("the full frame takes "), std::string::npos) << outcome.output;
}

} // namespace
