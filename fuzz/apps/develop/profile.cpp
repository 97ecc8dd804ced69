// ICC profiles of pictures.
#include "fuzz/harness.h"

#include "apps/develop/colourspace.h"
#include "tests/apps/develop/profiles.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace {

using apps_test::ProfileMaker;

/// Profiles of each kind, which chance would not come upon.
std::vector<App::Bytes> const &Seeds() {
    static std::vector<App::Bytes> const seeds = [] {
        auto const light = [](double code) { return std::pow(code, 2.2); };
        App::Bytes const rgb = apps_test::RgbProfile(
            ProfileMaker::Function(3, {2.4, 1 / 1.055, 0.055 / 1.055, 1 / 12.92, 0.04045}));
        return std::vector{rgb, apps_test::RgbProfile(ProfileMaker::Table(16, light)),
                           apps_test::GreyProfile(ProfileMaker::Table(16, light)),
                           ProfileMaker().table(rgb, 3).bytes()};
    }();
    return seeds;
}

} // namespace

extern "C" std::size_t LLVMFuzzerMutate(std::uint8_t *data, std::size_t size, std::size_t room);

/// Replaces libFuzzer's mutation of inputs: what is too short for a profile becomes one.
extern "C" std::size_t LLVMFuzzerCustomMutator(std::uint8_t *data, std::size_t size,
                                               std::size_t room, unsigned int seed) {
    constexpr std::size_t kHeader = 128;
    App::Bytes const &profile = Seeds()[seed % Seeds().size()];
    if (size < kHeader && profile.size() <= room) {
        std::copy(profile.begin(), profile.end(), data);
        size = profile.size();
    }
    return LLVMFuzzerMutate(data, size, room);
}

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    App::ColourTags tags;
    tags.profile.assign(data, data + size);
    for (unsigned int const channels : {1u, 3u}) {
        std::vector<std::string> warnings;
        auto const space = Develop::ColourSpace::Of(tags, {1, 1, channels, 8}, warnings);
        HOLDS(warnings.size() <= 1);
        for (std::string const &warning : warnings)
            HOLDS(warning.find('\n') == std::string::npos);
        for (std::size_t channel = 0; channel < channels; ++channel) {
            auto const lights = space.curve(channel).lights(8);
            auto const thresholds = space.curve(channel).thresholds(8);
            HOLDS(lights.front() == 0 && lights.back() == 1);
            for (std::size_t code = 0; code < thresholds.size(); ++code)
                HOLDS(lights[code] < thresholds[code] && thresholds[code] <= lights[code + 1]);
        }
        for (Develop::Triple const &row : space.matrixTo(Develop::ColourSpace::Srgb()))
            for (double const value : row)
                HOLDS(std::isfinite(value));
    }
    return 0;
}
