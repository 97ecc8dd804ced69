// What the codes of a picture mean as light.
#pragma once

#include "apps/common/picture.h"

#include <array>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace Develop {

/// How the codes of one channel and linear light correspond: increasing, from 0 to 0 and from 1 to
/// 1.
class ToneCurve {
public:
    virtual ~ToneCurve() = default;

    /// The light of a code from 0 to 1.
    virtual double decode(double code) const = 0;

    /// Light for every code of `bits` bits.
    std::vector<float> lights(unsigned int bits) const;

    /// The light at which rounding to codes of `bits` bits goes from one to the next: the nearest
    /// code of a light is the number of thresholds that it reaches.
    std::vector<float> thresholds(unsigned int bits) const;
};

/// Linear light of one space in that of another: rows of a matrix.
using ColourMatrix = std::array<std::array<double, 3>, 3>;

/// Tone curves and primaries.
class ColourSpace {
public:
    /// The colour space that a file tells of. What cannot be used is warned of, and sRGB stands for
    /// it.
    static ColourSpace Of(App::ColourTags const &tags, App::Shape const &shape,
                          std::vector<std::string> &warnings);
    static ColourSpace Srgb();
    static ColourSpace DisplayP3();

    /// Such as "Display P3 (its ICC profile)".
    std::string const &description() const { return description_; }

    /// @param channel of colour: 0 for grey, 0 to 2 for red, green and blue
    ToneCurve const &curve(std::size_t channel) const { return *curves_[channel]; }

    /// Takes this space's linear light to another's.
    ColourMatrix matrixTo(ColourSpace const &other) const;

    /// What tells a file's readers of this space.
    App::ColourTags const &tags() const { return tags_; }

private:
    std::string description_;
    std::array<std::shared_ptr<ToneCurve const>, 3> curves_;
    ColourMatrix toXyz_; ///< D50
    App::ColourTags tags_;
};

} // namespace Develop
