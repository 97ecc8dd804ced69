// What the codes of a picture mean as light.
#include "apps/develop/colourspace.h"

#include "apps/common/failure.h"
#include "apps/develop/iccprofile.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <utility>

namespace Develop {

namespace {

// Matrices of the same primaries differ by less, as profiles round them, each in its own way.
constexpr double kSameMatrix = 1e-3;

constexpr ColourMatrix kIdentity{{{1, 0, 0}, {0, 1, 0}, {0, 0, 1}}};

std::size_t Colours(App::Shape const &shape) {
    return shape.channels < 3 ? 1 : 3;
}

/// The bits by which a curve of a picture has to tell codes apart; those of floats are many.
unsigned int CodeBits(App::Shape const &shape) {
    return std::min(shape.bitsPerChannel, 16u);
}

/// Checked once, as every picture may need it.
std::shared_ptr<ToneCurve const> SharedSrgbCurve() {
    static auto const curve = std::make_shared<ToneCurve const>(SrgbCurve(), 16);
    return curve;
}

std::string GammaName(double gamma) {
    char text[40];
    std::snprintf(text, sizeof text, "gamma %.3g", gamma);
    return text;
}

std::string Warning(char const *subject, App::Failure const &failure) {
    return std::string(subject) + " " + failure.what() +
           ": sRGB is assumed; if colours look wrong, assign the right profile to the file first";
}

} // namespace

ColourSpace::ColourSpace(std::string description, CurvePtr curve, App::Primaries const &primaries)
    : description_(std::move(description)), curves_{curve, curve, curve}, toXyz_(ToXyz(primaries)),
      primaries_(primaries) {}

ColourSpace ColourSpace::Srgb() {
    ColourSpace space("sRGB", SharedSrgbCurve(), kSrgbPrimaries);
    space.tags_.isNamedSrgb = true;
    return space;
}

ColourSpace ColourSpace::DisplayP3() {
    ColourSpace space("Display P3", SharedSrgbCurve(), kDisplayP3Primaries);
    space.profileName_ = space.description_;
    return space;
}

ColourSpace ColourSpace::Of(App::ColourTags const &tags, App::Shape const &shape,
                            std::vector<std::string> &warnings) {
    ColourSpace space = Srgb();
    space.description_ = "sRGB (assumed)";
    space.tags_.isNamedSrgb = false;
    if (!tags.profile.empty()) {
        try {
            return OfProfile(tags.profile, shape);
        } catch (App::Failure const &failure) {
            warnings.push_back(Warning("its ICC profile", failure));
        }
    } else if (tags.isNamedSrgb) {
        space.description_ = "sRGB (as the file says)";
        space.tags_.isNamedSrgb = true;
    } else if (tags.gamma || tags.primaries) {
        try {
            return OfGamma(tags, shape);
        } catch (App::Failure const &failure) {
            warnings.push_back(Warning("the file", failure));
        }
    } else if (shape.bitsPerChannel == 32) {
        return ColourSpace("linear light (assumed)",
                           std::make_shared<ToneCurve const>(PowerCurve(1), 16), kSrgbPrimaries);
    }
    return space;
}

ColourSpace ColourSpace::OfProfile(App::Bytes const &profile, App::Shape const &shape) {
    IccProfile const icc = ReadIccProfile(profile, Colours(shape));
    ColourSpace space(icc.name + (icc.isOfTables
                                      ? " (its ICC profile of tables: one curve, from its greys)"
                                      : " (its ICC profile)"),
                      nullptr, kSrgbPrimaries);
    for (std::size_t i = 0; i < space.curves_.size(); ++i) {
        std::size_t const own = std::min(i, icc.curves.size() - 1);
        auto const same = std::find(icc.curves.begin(), icc.curves.end(), icc.curves[own]);
        auto const first = static_cast<std::size_t>(same - icc.curves.begin());
        space.curves_[i] =
            first < i ? space.curves_[first]
                      : std::make_shared<ToneCurve const>(icc.curves[own], CodeBits(shape));
    }
    if (icc.curves.size() == 3)
        space.toXyz_ = icc.toXyz;
    space.tags_.profile = profile;
    return space;
}

ColourSpace ColourSpace::OfGamma(App::ColourTags const &tags, App::Shape const &shape) {
    CurvePtr const curve =
        tags.gamma ? std::make_shared<ToneCurve const>(PowerCurve(*tags.gamma), CodeBits(shape))
                   : SharedSrgbCurve();
    std::string const name = tags.gamma ? GammaName(*tags.gamma) : "curve of sRGB";
    ColourSpace space(name + (tags.gamma && tags.primaries ? " and primaries (PNG gAMA, cHRM)"
                              : tags.gamma                 ? " (PNG gAMA)"
                                                           : " and primaries (PNG cHRM)"),
                      curve, tags.primaries.value_or(kSrgbPrimaries));
    space.profileName_ = tags.primaries ? name + " and primaries of the file" : name;
    space.tags_.gamma = tags.gamma;
    space.tags_.primaries = tags.primaries;
    return space;
}

ColourMatrix ColourSpace::matrixTo(ColourSpace const &other) const {
    ColourMatrix const matrix = Inverse(other.toXyz_) * toXyz_;
    double difference = 0;
    for (std::size_t row = 0; row < 3; ++row)
        for (std::size_t column = 0; column < 3; ++column)
            difference =
                std::max(difference, std::abs(matrix[row][column] - kIdentity[row][column]));
    return difference < kSameMatrix ? kIdentity : matrix;
}

App::ColourTags ColourSpace::tags(App::PictureHead const &written) const {
    bool const isToldByPng = tags_.gamma || tags_.primaries;
    if (profileName_.empty() || (isToldByPng && written.kind == App::FileKind::Png))
        return tags_;
    StoredCurve const &curve = curves_[0]->stored();
    App::ColourTags tags;
    if (Colours(written) == 1 && curve == SrgbCurve())
        tags.isNamedSrgb = true;
    else
        tags.profile = WriteIccProfile(profileName_, Colours(written), curve, *primaries_);
    return tags;
}

std::optional<ColourSpace> NamedColourSpace(std::string const &name) {
    if (name == "srgb")
        return ColourSpace::Srgb();
    if (name == "p3")
        return ColourSpace::DisplayP3();
    return std::nullopt;
}

} // namespace Develop
