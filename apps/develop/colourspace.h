// What the codes of a picture mean as light.
#pragma once

#include "apps/common/picture.h"
#include "apps/develop/colourmatrix.h"
#include "apps/develop/tonecurve.h"

#include <array>
#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace Develop {

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

    /// Channels with the same curve share one object.
    /// @param channel of colour: 0 for grey, 0 to 2 for red, green and blue
    ToneCurve const &curve(std::size_t channel) const { return *curves_[channel]; }

    /// Takes this space's linear light to another's; of the same primaries, rounded apart, the
    /// identity. Grey needs none: it is as light as before.
    ColourMatrix matrixTo(ColourSpace const &other) const;

    /// What tells the readers of a picture that is written, by its kind and channels, of this
    /// space: as the picture's file told it, or a profile where the kind has nothing else.
    App::ColourTags tags(App::PictureHead const &written) const;

private:
    using CurvePtr = std::shared_ptr<ToneCurve const>;

    /// A space of primaries with the same curve for all.
    ColourSpace(std::string description, CurvePtr curve, App::Primaries const &primaries);

    static ColourSpace OfProfile(App::Bytes const &profile, App::Shape const &shape);
    static ColourSpace OfGamma(App::ColourTags const &tags, App::Shape const &shape);

    std::string description_;
    std::array<CurvePtr, 3> curves_;
    ColourMatrix toXyz_{};                    ///< D50
    std::optional<App::Primaries> primaries_; ///< without a profile of the file
    App::ColourTags tags_;                    ///< of the file
    std::string profileName_;                 ///< of the profile to make; empty for none
};

/// The space of a name that people write: "srgb" or "p3".
std::optional<ColourSpace> NamedColourSpace(std::string const &name);

} // namespace Develop
