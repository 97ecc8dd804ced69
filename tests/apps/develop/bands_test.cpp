// How develop cuts pictures, and what it makes of their codes, on every way.
#include "apps/common/offscreengpu.h"
#include "apps/develop/glslsharpener.h"
#include "apps/develop/opencldeveloper.h"
#include "apps/develop/openclsharpener.h"
#include "apps/develop/opengldeveloper.h"
#include "apps/develop/photoqueue.h"
#include "tests/apps/develop/developfixture.h"

#include <atomic>
#include <map>

using namespace apps_test;
using namespace Develop;
using App::Image;

namespace {

/// Every way to develop, made once: a process opens one OpenCL runtime.
struct Ways {
    Ways() {
        OpenCLDevice const device = runtime.devices().at(0);
        all["opencl"] = std::make_unique<OpenCLDeveloper>(device);
        // The compiler of PoCL 3 mixes up what contexts of two threads build at the same time.
        Recipe const nothing;
        all["opencl"]->begin(Task({1, 1, 3, 8}, ColourSpace::Srgb(), nothing));
        all["glsl"] = std::make_unique<OpenGLDeveloper>(std::make_unique<GlslSharpener>("here"));
        all["shared"] = std::make_unique<OpenGLDeveloper>(
            std::make_unique<OpenCLSharpener>(device, gpu.context()));
    }

    App::OffscreenGpu gpu{std::string()};
    OpenCLRuntime runtime{App::ToText(ProgramFolder() / "ocl_runtime")};
    std::map<std::string, std::unique_ptr<Developer>> all;
};

class Bands : public DevelopFixture {
protected:
    static void SetUpTestSuite() { ways_ = std::make_unique<Ways>(); }
    static void TearDownTestSuite() { ways_.reset(); }

    /// Develops `in.png`. @return what it became
    Image developed(Developer &developer, Recipe const &recipe, BandPlan::Limits const &limits,
                    std::string const &base = std::string()) {
        std::atomic<bool> const isCancelled = false;
        std::size_t photos = 0;
        PhotoQueue(developer, recipe, base.empty() ? base : path(base), true, limits)
            .run(
                {{path("in.png"), path("out.png")}},
                [&](PhotoResult const &result) {
                    ++photos;
                    if (result.failure)
                        std::rethrow_exception(result.failure);
                },
                isCancelled);
        EXPECT_EQ(photos, 1u);
        return read("out.png");
    }

    static std::unique_ptr<Ways> ways_;
};

std::unique_ptr<Ways> Bands::ways_;

double WorstDifference(Image const &a, Image const &b) {
    double worst = 0;
    for (std::size_t i = 0; i < ValueCount(a); ++i)
        worst = std::max(worst, std::abs(1.0 * Value(a, i) - 1.0 * Value(b, i)));
    return worst;
}

// Neither the cut into bands and tiles nor computing over a base only what spots touch changes a
// byte. The ways differ by what floats round.
TEST_F(Bands, ChangeNoByte) {
    App::Shape const shapes[] = {{61, 47, 3, 8}, {50, 64, 2, 16}, {1, 80, 4, 8}};
    BandPlan::Limits const cuts[] = {{1, 20, 1}, {700, 64, std::size_t{1} << 20}};
    for (App::Shape const &shape : shapes) {
        write("in.png", RandomPicture(shape, 5));
        for (double const amount : {0.0, 1.5}) {
            Recipe plain;
            plain.exposure = 0.4;
            plain.sharpening = {amount, 2};
            Recipe recipe = plain;
            recipe.spots = {{5.5, 7.25, 6, 1}, {9, 8, 5, -2}, {45, 60, 8, 0.5}, {30, 20, 3, 2}};
            Image first;
            for (auto const &[name, way] : ways_->all) {
                SCOPED_TRACE(name + ", " + shape.description() + ", " + std::to_string(amount));
                Image const whole = developed(*way, recipe, BandPlan::Limits());
                write("base.png", developed(*way, plain, BandPlan::Limits()));
                for (BandPlan::Limits const &cut : cuts) {
                    EXPECT_EQ(whole.pixels, developed(*way, recipe, cut).pixels) << cut.pixels;
                    EXPECT_EQ(whole.pixels, developed(*way, recipe, cut, "base.png").pixels)
                        << cut.pixels;
                }
                if (first.pixels.empty())
                    first = whole;
                EXPECT_LE(WorstDifference(first, whole), 1);
            }
        }
    }
}

/// The code from 0 to 1 that stands for a light.
double CodeOf(ToneCurve const &curve, double light) {
    double least = 0, most = 1;
    for (int i = 0; i < 50; ++i) {
        double const middle = (least + most) / 2;
        (curve.decode(middle) <= light ? least : most) = middle;
    }
    return least;
}

// Every kind of codes in another space's light, against double precision; floats keep what is
// brighter than white.
TEST_F(Bands, CodesBecomeThoseOfAnotherSpace) {
    for (unsigned int const bits : {8u, 16u, 32u}) {
        Image photo = RandomPicture({64, 40, 3, bits}, bits);
        std::vector<float> floats(ValueCount(photo));
        std::mt19937 random(1);
        for (float &value : floats)
            value = std::uniform_real_distribution<float>(0, 2)(random);
        if (bits == 32)
            std::memcpy(photo.pixels.data(), floats.data(), photo.pixels.size());
        std::vector<std::string> warnings;
        ColourSpace const from = ColourSpace::Of({}, photo, warnings);
        ColourSpace const to = ColourSpace::DisplayP3();
        Recipe recipe;
        recipe.exposure = -1;
        recipe.convertTo = to;
        Task const task(photo, from, recipe);
        Band source, target;
        source.hold({0, photo.height}, photo);
        std::copy(photo.pixels.begin(), photo.pixels.end(), source.row(0));
        target.hold({0, photo.height}, photo);
        ORU::IntegerRect const all = PixelRect(0, 0, photo.width, photo.height);
        for (auto const &[name, way] : ways_->all) {
            way->begin(task);
            way->develop(source, {all, all}, target);
            Image result = photo;
            std::copy_n(target.row(0), result.pixels.size(), result.pixels.data());
            double const levels = bits == 32 ? 1 : Levels(photo);
            ColourMatrix const matrix = from.matrixTo(to);
            double worst = 0;
            for (std::size_t i = 0; i < ValueCount(photo); ++i) {
                double light = 0;
                for (std::size_t c = 0; c < 3; ++c) {
                    std::size_t const at = i / 3 * 3 + c;
                    light +=
                        matrix[i % 3][c] / 2 *
                        (bits == 32 ? floats[at] : from.curve(c).decode(Value(photo, at) / levels));
                }
                float value = 0;
                std::memcpy(&value, result.pixels.data() + i * bits / 8, bits == 32 ? 4 : 0);
                double const code = bits == 32 ? value : Value(result, i) / levels;
                double const exact = CodeOf(to.curve(i % 3), std::max(light, 0.0));
                if (light <= 1)
                    worst = std::max(worst, std::abs(code - exact));
                else
                    EXPECT_GE(code, 1);
            }
            EXPECT_LE(worst, bits == 32 ? 1e-5 : 1 / levels) << name << ", " << bits << " bits";
        }
    }
}

} // namespace
