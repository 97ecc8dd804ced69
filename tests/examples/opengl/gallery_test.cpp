// Runs the offscreen examples and compares their whole pictures with what they should be.
#include "tests/support/program.h"

#include "apps/common/imagefile.h"
#include "apps/common/unicode.h"

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdlib>

using apps_test::Outcome;
using apps_test::RunProgram;
using apps_test::TemporaryFolder;

namespace {

using Colour = std::array<double, 3>; ///< red, green, blue in levels of 255

/// Runs an example and gives the picture it saves.
App::Image PictureOf(std::string const &program) {
    TemporaryFolder const folder;
    Outcome const outcome = RunProgram(program, {"picture.png"}, folder.path());
    EXPECT_EQ(0, outcome.exitCode) << outcome.errors;
    EXPECT_EQ("", outcome.errors);
    return App::ReadImage(folder.path() / "picture.png", {4096});
}

/// Compares every pixel with a function of its place, where y counts rows from the bottom.
template<class Expected>
void ExpectPicture(App::Image const &picture, App::Shape const &shape, int tolerance,
                   Expected expected) {
    ASSERT_TRUE(shape == picture) << picture.description();
    int wrong = 0;
    for (std::size_t y = 0; y < shape.height; ++y) {
        for (std::size_t x = 0; x < shape.width; ++x) {
            Colour const wanted = expected(static_cast<int>(x), static_cast<int>(y));
            unsigned char const *pixel =
                picture.row(shape.height - 1 - y) + x * picture.bytesPerPixel();
            for (unsigned int c = 0; c < shape.channels; ++c) {
                if (std::abs(pixel[c] - std::lround(wanted[c])) > tolerance && ++wrong <= 5) {
                    ADD_FAILURE() << "at " << x << ", " << y << " channel " << c << " is "
                                  << int{pixel[c]} << " and not " << wanted[c];
                }
            }
        }
    }
    EXPECT_EQ(0, wrong) << "values differ";
}

} // namespace

TEST(Gallery, HelloOffscreen) {
    // Corners in pixels; the weights of a point are the areas it spans with the other two. No pixel
    // centre lies on an edge, so which pixels are drawn is a question with one answer.
    double const x[] = {40, 280, 168}, y[] = {30, 30, 210};
    auto const area = [&](int a, int b, double px, double py) {
        return (x[b] - x[a]) * (py - y[a]) - (y[b] - y[a]) * (px - x[a]);
    };
    double const whole = area(0, 1, x[2], y[2]);
    ExpectPicture(PictureOf("hello_offscreen.exe"), {320, 240, 3, 8}, 1, [&](int px, int py) {
        Colour weights;
        for (int corner = 0; corner < 3; ++corner)
            weights[static_cast<std::size_t>(corner)] =
                area((corner + 1) % 3, (corner + 2) % 3, px + 0.5, py + 0.5) / whole;
        for (double const weight : weights) {
            if (weight < 0)
                return Colour{255 / 8., 255 / 8., 255 / 8.};
        }
        for (double &weight : weights)
            weight *= 255;
        return weights;
    });
}

TEST(Gallery, FloatTexture) {
    double const lamps[3][3] = {{80, 60, 8000}, {200, 140, 1500}, {270, 50, 100}};
    ExpectPicture(PictureOf("float_texture.exe"), {320, 200, 1, 8}, 1, [&](int x, int y) {
        double light = 0;
        for (auto const &lamp : lamps)
            light +=
                lamp[2] / (std::pow(x + 0.5 - lamp[0], 2) + std::pow(y + 0.5 - lamp[1], 2) + 400);
        return Colour{255 * std::sqrt(light / (1 + light))};
    });
}

TEST(Gallery, StreamingUpload) {
    ExpectPicture(PictureOf("streaming_upload.exe"), {320, 240, 3, 8}, 0, [](int x, int y) {
        int const frame = (2 - y / 80) * 4 + x / 80;
        int const dx = 2 * (x % 80) - 79, dy = 2 * (y % 80) - 79; // from the middle, in half pixels
        int const ring = (dx * dx + dy * dy) / 32 - 20 * frame;
        return Colour{static_cast<double>(ring & 255), 3.0 * (x % 80), 3.0 * (y % 80)};
    });
}

TEST(Gallery, BlendAndLines) {
    ExpectPicture(PictureOf("blend_and_lines.exe"), {240, 160, 3, 8}, 1, [](int x, int y) {
        auto const inside = [&](int left, int bottom, int right, int top) {
            return left <= x && x < right && bottom <= y && y < top;
        };
        Colour colour = {255, 255, 255};
        auto const glass = [&](Colour const &tint) {
            for (std::size_t c = 0; c < 3; ++c)
                colour[c] = (colour[c] + tint[c]) / 2;
        };
        if (inside(20, 60, 120, 140))
            glass({255, 0, 0});
        if (inside(80, 40, 200, 120))
            glass({0, 0, 255});
        if (inside(180, 100, 220, 140))
            colour = {0, 127.5, 0};
        bool const dash = (x - 20) / 16 % 2 == 0; // four pixels for each of four bits, on and off
        if (inside(20, 30, 220, 31) || inside(20, 18, 220, 23) || inside(20, 150, 220, 151) ||
            (inside(20, 8, 220, 13) && dash))
            colour = {0, 0, 0};
        return colour;
    });
}

TEST(Gallery, ExamplesReportFailures) {
    TemporaryFolder const folder;
    Outcome const usage = RunProgram("hello_offscreen.exe", {}, folder.path());
    EXPECT_EQ(2, usage.exitCode);
    EXPECT_NE(std::string::npos, usage.errors.find("FILE")) << usage.errors;
    Outcome const unwritable =
        RunProgram("hello_offscreen.exe", {"missing/folder/picture.png"}, folder.path());
    EXPECT_EQ(1, unwritable.exitCode);
    EXPECT_NE("", unwritable.errors);
}
