// What codes mean as light, against formulas and numbers of the standards.
#include "apps/develop/colourspace.h"
#include "tests/apps/develop/profiles.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <limits>

using namespace apps_test;
using namespace Develop;
using App::Bytes;
using App::ColourTags;
using testing::HasSubstr;
using testing::IsEmpty;

namespace {

using Maker = ProfileMaker;
using Formula = std::function<double(double)>;

Formula Power(double gamma) {
    return [gamma](double code) { return std::pow(code, gamma); };
}

double SrgbLight(double code) {
    return code <= 0.04045 ? code / 12.92 : std::pow((code + 0.055) / 1.055, 2.4);
}

double ProPhotoLight(double code) {
    return code < 1.0 / 32 ? code / 16 : std::pow(code, 1.8);
}

double LightOfLStar(double code) {
    return code <= 0.08 ? code * 2700 / 24389 : std::pow((code + 0.16) / 1.16, 3);
}

std::vector<double> const kSrgbNumbers{2.4, 1 / 1.055, 0.055 / 1.055, 1 / 12.92, 0.04045};
std::vector<double> const kLStarNumbers{3,    1 / 1.16, 0.16 / 1.16, 2700.0 / 24389,
                                        0.08, 0.002,    0.002};
std::vector<double> const kFallingNumbers{
    2.4, 1 / 1.055, 0.055 / 1.055, 1 / 12.92, 0.04045, -1.0 / 65536, 0};

App::Shape Shape(unsigned int channels, unsigned int bits = 8) {
    return {4, 4, channels, bits};
}

ColourTags Profile(Bytes bytes) {
    ColourTags tags;
    tags.profile = std::move(bytes);
    return tags;
}

ColourTags Gamma(double gamma, std::optional<App::Primaries> primaries = {}) {
    return {{}, false, gamma, primaries};
}

/// The space of tags that nothing is wrong with.
ColourSpace Space(ColourTags const &tags, App::Shape const &shape = Shape(3)) {
    std::vector<std::string> warnings;
    ColourSpace space = ColourSpace::Of(tags, shape, warnings);
    EXPECT_THAT(warnings, IsEmpty());
    return space;
}

std::size_t Nearest(std::vector<float> const &thresholds, double light) {
    auto const reached =
        std::upper_bound(thresholds.begin(), thresholds.end(), static_cast<float>(light));
    return static_cast<std::size_t>(reached - thresholds.begin());
}

/// Light of all codes, and of the places between them, against a formula; every code comes back
/// from its light.
void ExpectCurve(ToneCurve const &curve, unsigned int bits, Formula const &formula,
                 double tolerance) {
    auto const lights = curve.lights(bits), thresholds = curve.thresholds(bits);
    double const last = std::pow(2, bits) - 1;
    ASSERT_EQ(lights.size(), last + 1);
    ASSERT_EQ(thresholds.size(), last);
    std::size_t lost = 0;
    double worst = 0; // in roundings to a float, where there is no tolerance
    for (std::size_t code = 0; code < lights.size(); ++code) {
        lost += Nearest(thresholds, lights[code]) != code;
        double const exact = formula(static_cast<double>(code) / last);
        worst = std::max(worst, (std::abs(lights[code] - exact) - tolerance) / exact);
        if (code == thresholds.size())
            break;
        // What reaches the threshold is at or above the place between, the float below is not.
        double const between = formula((static_cast<double>(code) + 0.5) / last);
        double const slack = tolerance + 1e-12 * between;
        lost += thresholds[code] < between - slack;
        lost += std::nextafter(thresholds[code], 0.0f) >= between + slack;
    }
    EXPECT_EQ(lost, 0u);
    EXPECT_LE(worst, std::numeric_limits<float>::epsilon() / 2 * (1 + 1e-6));
    EXPECT_EQ(lights.front(), 0);
    EXPECT_EQ(lights.back(), 1);
}

TEST(Colour, EveryCodeHasTheLightOfItsFormulaAndComesBack) {
    constexpr double kRounded = 2.5e-5; // the numbers of a function in a profile
    constexpr double kTable = 2.5e-5;   // and the light in its tables
    struct Case {
        std::string name, description;
        ColourTags tags;
        Formula light;
        double tolerance = 0;
        unsigned int channels = 3;
    };
    std::string const profile = "Test (its ICC profile)";
    Case const cases[] = {
        {"untagged", "sRGB (assumed)", {}, SrgbLight},
        {"named", "sRGB (as the file says)", {{}, true, 3.0, {}}, SrgbLight},
        {"gAMA", "gamma 2.2 (PNG gAMA)", Gamma(1 / 0.45455), Power(1 / 0.45455)},
        {"gAMA 1", "gamma 1 (PNG gAMA)", Gamma(1), Power(1), 0, 1},
        {"Adobe RGB", profile, Profile(RgbProfile(Maker::Function(0, {563.0 / 256}))),
         Power(563.0 / 256)},
        {"sRGB", profile, Profile(RgbProfile(Maker::Function(3, kSrgbNumbers))), SrgbLight,
         kRounded},
        {"falls by a rounding", profile, Profile(RgbProfile(Maker::Function(4, kFallingNumbers))),
         SrgbLight, 2 * kRounded},
        {"ProPhoto", profile,
         Profile(RgbProfile(Maker::Function(3, {1.8, 1, 0, 1.0 / 16, 1.0 / 32}))), ProPhotoLight,
         kRounded},
        {"begins above 0", profile, Profile(RgbProfile(Maker::Function(4, kLStarNumbers))),
         LightOfLStar, kRounded},
        {"CIE 122", profile, Profile(GreyProfile(Maker::Function(1, {2, 1.0625, -0.0625}))),
         [](double code) { return std::pow(std::max(0.0, 1.0625 * code - 0.0625), 2); }, kRounded,
         1},
        {"shifted", profile, Profile(GreyProfile(Maker::Function(2, {2, 0.97, 0.03, -0.0009}))),
         [](double code) { return (std::pow(0.97 * code + 0.03, 2) - 0.0009) / 0.9991; }, kRounded,
         1},
        {"table", profile, Profile(RgbProfile(Maker::Table(1024, SrgbLight))), SrgbLight, kTable},
        {"table flat at black", profile, Profile(RgbProfile(Maker::Table(4096, Power(2.2)))),
         Power(2.2), kTable},
        {"grey table", profile, Profile(GreyProfile(Maker::Table(4096, LightOfLStar))),
         LightOfLStar, kTable, 1},
    };
    for (Case const &c : cases)
        for (unsigned int const bits : {8u, 16u}) {
            SCOPED_TRACE(c.name + ", " + std::to_string(bits) + " bits");
            ColourSpace const space = Space(c.tags, Shape(c.channels, bits));
            EXPECT_EQ(space.description(), c.description);
            for (std::size_t channel = 0; channel < c.channels; ++channel)
                ExpectCurve(space.curve(channel), bits, c.light, c.tolerance);
        }
}

// A profile of tables is taken by the curve of its greys, as fine as its table.
TEST(Colour, TablesAreTakenByTheCurveOfTheirGreys) {
    Bytes const bytes = Maker().table(RgbProfile(Maker::Function(0, {1.8}), kP3Colorants)).bytes();
    for (unsigned int const bits : {8u, 16u}) {
        ColourSpace const space = Space(Profile(bytes), Shape(3, bits));
        EXPECT_THAT(space.description(), HasSubstr("tables: one curve, from its greys"));
        for (std::size_t channel = 0; channel < 3; ++channel)
            ExpectCurve(space.curve(channel), bits, Power(1.8), 1e-3);
    }
}

/// Largest difference of a matrix to the nine numbers of another.
double Difference(ColourMatrix const &matrix, std::array<double, 9> const &other) {
    double largest = 0;
    for (std::size_t i = 0; i < other.size(); ++i)
        largest = std::max(largest, std::abs(matrix[i / 3][i % 3] - other[i]));
    return largest;
}

constexpr std::array<double, 9> kIdentity{1, 0, 0, 0, 1, 0, 0, 0, 1};
constexpr App::Primaries kAdobePrimaries{
    {{0.3127, 0.3290}, {0.64, 0.33}, {0.21, 0.71}, {0.15, 0.06}}};

// Against published matrices; whatever is converted, greys stay greys.
TEST(Colour, ConvertsBetweenPrimariesAsPublished) {
    constexpr std::array<double, 9> kP3ToSrgb{1.2249, -0.2249, 0,       -0.0420, 1.0420,
                                              0,      -0.0196, -0.0786, 1.0983};
    constexpr std::array<double, 9> kAdobeToSrgb{1.3984, -0.3984, 0, 0, 1, 0, 0, -0.0429, 1.0429};
    constexpr std::array<double, 9> kProPhotoToSrgb{2.0344,  -0.7276, -0.3067, -0.2288, 1.2317,
                                                    -0.0029, -0.0086, -0.1533, 1.1618};
    auto const profile = [](Colorants const &colorants) {
        return Profile(RgbProfile(Maker::Function(0, {2.2}), colorants));
    };
    std::pair<ColourSpace, std::array<double, 9>> const cases[] = {
        {Space(profile(kP3Colorants)), kP3ToSrgb},
        {ColourSpace::DisplayP3(), kP3ToSrgb},
        {Space(profile(kAdobeColorants)), kAdobeToSrgb},
        {Space(Gamma(2.2, kAdobePrimaries)), kAdobeToSrgb},
        {Space(profile(kProPhotoColorants)), kProPhotoToSrgb},
        {Space(profile(kSrgbColorants)), kIdentity},
        {Space(Gamma(2.2)), kIdentity},
    };
    for (auto const &[space, published] : cases) {
        SCOPED_TRACE(space.description());
        ColourMatrix const matrix = space.matrixTo(ColourSpace::Srgb());
        EXPECT_LE(Difference(matrix, published), 3e-4);
        for (Triple const &row : matrix)
            EXPECT_NEAR(row[0] + row[1] + row[2], 1, 1e-12);
    }
    EXPECT_EQ(
        Difference(Space(profile(kP3Colorants)).matrixTo(ColourSpace::DisplayP3()), kIdentity), 0);
    ColourSpace const table = Space(Profile(Maker().table(profile(kP3Colorants).profile).bytes()));
    EXPECT_LE(Difference(table.matrixTo(ColourSpace::Srgb()), kP3ToSrgb), 3e-3);

    // The red of Display P3 lies outside sRGB, whose nearest codes are its ends.
    Triple const red = ColourSpace::DisplayP3().matrixTo(ColourSpace::Srgb()) * Triple{1, 0, 0};
    auto const thresholds = ColourSpace::Srgb().curve(0).thresholds(8);
    EXPECT_GT(red[0], 1.2);
    EXPECT_LT(red[1], -0.04);
    EXPECT_EQ(Nearest(thresholds, red[0]), 255u);
    EXPECT_EQ(Nearest(thresholds, red[1]), 0u);
}

/// Expects one warning, with a certain text, and sRGB in place of what the tags tell.
void ExpectRefused(ColourTags const &tags, std::string const &reason,
                   App::Shape const &shape = Shape(3)) {
    std::vector<std::string> warnings;
    ColourSpace const space = ColourSpace::Of(tags, shape, warnings);
    EXPECT_THAT(warnings, testing::ElementsAre(HasSubstr(reason))) << reason;
    EXPECT_EQ(space.description(), "sRGB (assumed)") << reason;
    EXPECT_EQ(space.curve(0).lights(8), ColourSpace::Srgb().curve(0).lights(8)) << reason;
    EXPECT_THAT(space.tags({}).profile, IsEmpty()) << reason;
}

TEST(Colour, WhatCannotBeUsedIsWarnedOfOnce) {
    auto const linear = [] { return Maker::Function(0, {1}); };
    auto const curve = [](Formula const &light) { return RgbProfile(Maker::Table(64, light)); };
    auto const ofClass = [&](cmsProfileClassSignature deviceClass) {
        return Maker().curve(linear()).colorants(kSrgbColorants).deviceClass(deviceClass).bytes();
    };
    auto const ofSpace = [&](cmsColorSpaceSignature space) {
        return Maker(space).curve(linear()).colorants(kSrgbColorants).bytes();
    };
    std::pair<Bytes, std::string> const profiles[] = {
        {Bytes(10, 'x'), "is damaged"},
        {Bytes(std::size_t{40} << 20), "is too large for one: 40 MiB"},
        {ofSpace(cmsSigCmykData), "is for CMYK pictures"},
        {ofSpace(cmsSigLabData), "is for neither RGB nor grey"},
        {GreyProfile(linear()), "is for grey pictures, and this one has colours"},
        {ofClass(cmsSigLinkClass), "links or names colours"},
        {ofClass(cmsSigNamedColorClass), "links or names colours"},
        {Maker().colorants(kSrgbColorants).bytes(), "neither curves nor tables"},
        {Maker().curve(linear()).bytes(), "is damaged"},
        {RgbProfile(linear(), {.4, .2, .1, .4, .2, .1, .1, .1, .6}), "span no colours"},
        {RgbProfile(linear(), {.9, .9, .1, .1, .2, .7, .7, .7, .1}), "white outside"},
        {curve([](double x) { return 1 - x; }), "does not go from black to white"},
        {curve([](double x) { return x / 2; }), "does not go from black to white"},
        {curve([](double x) { return x + (x == 0.0 ? 0.1 : 0); }), "does not go from black"},
        {curve([](double x) { return x + std::sin(7 * 3.14159265358979 * x) / 9; }), "falls"},
        {curve([](double x) { return std::clamp(x, 0.0, 0.5) + (x == 1 ? 0.5 : 0.0); }), "is flat"},
    };
    for (auto const &[bytes, reason] : profiles)
        ExpectRefused(Profile(bytes), reason, Shape(3, 16));
    ExpectRefused(Profile(RgbProfile(linear())), "is for RGB pictures, and this one is grey",
                  Shape(2));
    double const nan = std::numeric_limits<double>::quiet_NaN();
    for (double const gamma : {0.0, -1.0, 1e6, 1e-6, nan})
        ExpectRefused(Gamma(gamma), "the file has a curve");
    ExpectRefused(Gamma(1, App::Primaries{{{.3, .3}, {.3, .3}, {.3, .3}, {.3, .3}}}), "no colours");
    ExpectRefused(Gamma(1, App::Primaries{{{.9, .05}, {.64, .33}, {.3, .6}, {.15, .06}}}), "white");
    ExpectRefused(Gamma(1, App::Primaries{{{nan, 0}, {.64, 0}, {.3, 0}, {.15, 0}}}), "no colours");
}

// Whatever happens to a profile's bytes, it is refused or the codes still come back.
TEST(Colour, DamagedProfilesAreRefusedOrHarmless) {
    Bytes const whole[] = {RgbProfile(Maker::Function(3, kSrgbNumbers)),
                           RgbProfile(Maker::Table(32, SrgbLight))};
    std::size_t refused = 0;
    auto const look = [&](Bytes bytes) {
        std::vector<std::string> warnings;
        ColourSpace const space = ColourSpace::Of(Profile(std::move(bytes)), Shape(3), warnings);
        ASSERT_LE(warnings.size(), 1u);
        refused += warnings.size();
        for (std::size_t channel = 0; channel < 3; ++channel) {
            auto const lights = space.curve(channel).lights(8);
            auto const thresholds = space.curve(channel).thresholds(8);
            for (std::size_t code = 0; code < lights.size(); ++code)
                ASSERT_EQ(Nearest(thresholds, lights[code]), code);
        }
    };
    for (Bytes const &bytes : whole)
        for (std::size_t i = 0; i < bytes.size(); ++i) {
            if (i % 8 == 0)
                look(Bytes(bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(i)));
            if (&bytes == whole && i % 4 != 3) // the lowest byte of a number, or some of a text
                continue;
            Bytes changed = bytes;
            changed[i] ^= 0xff;
            look(changed);
        }
    EXPECT_GT(refused, 100u);
}

App::PictureHead Written(App::FileKind kind, unsigned int channels = 3) {
    App::PictureHead head;
    head.channels = channels;
    head.kind = kind;
    return head;
}

// What is written tells its readers the same as what was read, in the kind's own way.
TEST(Colour, TheSpaceIsToldOn) {
    auto const png = Written(App::FileKind::Png), jpeg = Written(App::FileKind::Jpeg);
    Bytes const profile = RgbProfile(Maker::Function(3, kSrgbNumbers), kP3Colorants);
    EXPECT_EQ(Space(Profile(profile)).tags(jpeg).profile, profile);
    EXPECT_TRUE(NamedColourSpace("srgb")->tags(jpeg).isNamedSrgb);
    EXPECT_FALSE(Space({}).tags(jpeg).isNamedSrgb);
    EXPECT_FALSE(NamedColourSpace("SRGB"));
    EXPECT_EQ(Space(Gamma(2.2, kAdobePrimaries)).tags(png).gamma, 2.2);
    EXPECT_EQ(Space(Gamma(2.2, kAdobePrimaries)).tags(png).primaries, kAdobePrimaries);
    EXPECT_THAT(Space(Gamma(2.2)).tags(png).profile, IsEmpty());
    EXPECT_TRUE(NamedColourSpace("p3")->tags(Written(App::FileKind::Png, 1)).isNamedSrgb);

    ColourTags primaries;
    primaries.primaries = kAdobePrimaries;
    ColourSpace const made[] = {ColourSpace::DisplayP3(), Space(Gamma(1.8, kAdobePrimaries)),
                                Space(Gamma(2.2)), Space(primaries)};
    for (ColourSpace const &space : made)
        for (unsigned int const channels : {1u, 3u}) {
            ColourTags const tags = space.tags(Written(App::FileKind::Jpeg, channels));
            if (tags.isNamedSrgb)
                continue; // grey, with the curve of sRGB
            ColourSpace const read = Space(tags, Shape(channels));
            EXPECT_EQ(read.description().find(space.description().substr(0, 9)), 0u);
            ExpectCurve(
                read.curve(0), 8, [&](double code) { return space.curve(0).decode(code); }, 2e-5);
            EXPECT_TRUE(channels == 1 || Difference(read.matrixTo(space), kIdentity) == 0);
            EXPECT_EQ(tags.profile, space.tags(Written(App::FileKind::Tiff, channels)).profile);
            EXPECT_EQ(Bytes(tags.profile.begin() + 24, tags.profile.begin() + 36),
                      Bytes({0x07, 0xea, 0, 1, 0, 1, 0, 0, 0, 0, 0, 0})); // no time of now
        }
}

// Floats are light where nothing else is said.
TEST(Colour, FloatsAreLight) {
    EXPECT_TRUE(Space({}, Shape(3, 32)).curve(0).isLinear());
    EXPECT_EQ(Space({}, Shape(3, 32)).description(), "linear light (assumed)");
    EXPECT_TRUE(
        Space(Profile(RgbProfile(Maker::Function(0, {1}))), Shape(3, 32)).curve(2).isLinear());
    EXPECT_FALSE(Space({{}, true, {}, {}}, Shape(3, 32)).curve(0).isLinear());
}

} // namespace
