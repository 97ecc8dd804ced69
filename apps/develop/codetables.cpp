// Tables between the codes of a picture and linear light.
#include "apps/develop/codetables.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace Develop {

namespace {

constexpr unsigned int kBitsOfFloats = 16; ///< curves of floats have as many entries

bool HasOneCurve(ColourSpace const &space) {
    return &space.curve(0) == &space.curve(1) && &space.curve(0) == &space.curve(2);
}

bool AreLinear(ColourSpace const &space, std::size_t curves) {
    for (std::size_t c = 0; c < curves; ++c)
        if (!space.curve(c).isLinear())
            return false;
    return true;
}

void Append(std::vector<float> const &values, std::vector<float> &all) {
    all.insert(all.end(), values.begin(), values.end());
}

} // namespace

CodeTables::CodeTables(ColourSpace const &from, ColourSpace const &to, App::Shape const &shape)
    : curves(shape.channels < 3 || (HasOneCurve(from) && HasOneCurve(to)) ? 1 : 3), indices(1),
      steps(0), isLinear(false), becomesLinear(false) {
    bool const isFloat = shape.bitsPerChannel == 32;
    unsigned int const bits = isFloat ? kBitsOfFloats : shape.bitsPerChannel;
    levels = std::size_t{1} << bits;
    for (std::size_t c = 0; c < curves; ++c) {
        Append(from.curve(c).lights(bits), lights);
        if (isFloat) {
            Append(to.curve(c).lights(bits), thresholds);
            continue;
        }
        Append(to.curve(c).thresholds(bits), thresholds);
        thresholds.resize((c + 1) * levels, std::numeric_limits<float>::infinity());
    }
    if (isFloat) {
        isLinear = AreLinear(from, curves);
        becomesLinear = AreLinear(to, curves);
        return;
    }
    indices = std::max(std::size_t{4096}, levels);
    index.reserve(curves * indices);
    // An entry begins one place early and ends one late, for roots that are computed inexactly.
    auto const lightAt = [this](double place) {
        return std::pow(std::max(place, 0.0) / static_cast<double>(indices - 1), 2);
    };
    for (std::size_t c = 0; c < curves; ++c) {
        float const *const begin = thresholds.data() + c * levels;
        std::size_t least = 0, most = 0;
        for (std::size_t i = 0; i < indices; ++i) {
            auto const place = static_cast<double>(i);
            while (begin[least] < lightAt(place - 0.5))
                ++least;
            while (begin[most] < lightAt(place + 1.5))
                ++most;
            index.push_back(static_cast<std::uint16_t>(least));
            steps = std::max(steps, most - least);
        }
    }
}

} // namespace Develop
