// How the codes of a channel and linear light correspond.
#include "apps/develop/tonecurve.h"

#include "apps/common/failure.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <limits>
#include <utility>

namespace Develop {

namespace {

// Profiles of cameras and screens begin a little above black; what begins further up is no curve of
// a picture.
constexpr double kLargestOffset = 0.01;

// Files round what they store to this, or coarser.
constexpr double kStoredStep = 1.0 / 65535;

double Interpolated(std::vector<double> const &values, double place) {
    double const position = std::clamp(place, 0.0, 1.0) * static_cast<double>(values.size() - 1);
    std::size_t const index = std::min(static_cast<std::size_t>(position), values.size() - 2);
    double const part = position - static_cast<double>(index);
    return values[index] + part * (values[index + 1] - values[index]);
}

/// The smallest float that is not below a value.
float FloatNotBelow(double value) {
    auto const nearest = static_cast<float>(value);
    return nearest < value ? std::nextafter(nearest, std::numeric_limits<float>::infinity())
                           : nearest;
}

/// Whether floats tell a curve's codes and the places between them apart, also on hardware that
/// takes the smallest floats for 0.
bool IsDistinct(std::vector<double> const &samples) {
    auto const isNoRise = [](double a, double b) {
        return !(static_cast<float>(a) < static_cast<float>(b));
    };
    return samples[1] >= std::numeric_limits<float>::min() &&
           std::adjacent_find(samples.begin(), samples.end(), isNoRise) == samples.end();
}

/// Makes what falls by a rounding flat.
/// @throws Failure when it falls further
void Level(std::vector<double> &samples) {
    std::vector<double> lowest(samples);
    for (std::size_t i = samples.size() - 1; i-- > 0;)
        lowest[i] = std::min(lowest[i], lowest[i + 1]);
    double highest = 0;
    for (std::size_t i = 0; i < samples.size(); ++i) {
        highest = std::max(highest, samples[i]);
        if (!(highest - lowest[i] <= 2 * kStoredStep))
            throw App::Failure("has a curve that falls");
        samples[i] = (highest + lowest[i]) / 2;
    }
}

/// Makes what is flat rise by less than a stored step, within what it lies between.
void Incline(std::vector<double> &samples) {
    std::size_t const size = samples.size();
    std::vector<double> const flat(samples);
    for (std::size_t first = 0, end = 0; first < size; first = end) {
        double const value = flat[first];
        while (end < size && flat[end] == value)
            ++end;
        if (end - first < 2)
            continue;
        double reach = kStoredStep;
        if (first > 0)
            reach = std::min(reach, value - flat[first - 1]);
        if (end < size)
            reach = std::min(reach, flat[end] - value);
        // Half of the reach to either side; black and white stay what they are.
        double const low = first > 0 ? value - reach / 2 : value;
        double const high = end < size ? value + reach / 2 : value;
        double const steps =
            static_cast<double>(end - first) + (first > 0 ? 1 : 0) - (end < size ? 0 : 1);
        for (std::size_t i = first; i < end; ++i)
            samples[i] =
                low + (high - low) * static_cast<double>(i - first + (first > 0 ? 1 : 0)) / steps;
    }
}

} // namespace

double StoredCurve::light(double code) const {
    if (!table.empty())
        return Interpolated(table, code);
    auto const [g, a, b, c, d, e, f] = parameters;
    auto const power = [&, g = g, a = a, b = b] {
        return std::pow(std::max(a * code + b, 0.0), g);
    };
    switch (function) {
    case 0:
        return std::pow(code, g);
    case 1:
        return power();
    case 2:
        return power() + c;
    case 3:
        return code >= d ? power() : c * code;
    default:
        return code >= d ? power() + e : c * code + f;
    }
}

bool operator==(StoredCurve const &a, StoredCurve const &b) {
    return a.function == b.function && a.parameters == b.parameters && a.table == b.table;
}

StoredCurve SrgbCurve() {
    return {3, {2.4, 1 / 1.055, 0.055 / 1.055, 1 / 12.92, 0.04045}, {}};
}

StoredCurve PowerCurve(double gamma) {
    return {0, {gamma}, {}};
}

ToneCurve::ToneCurve(StoredCurve const &stored, unsigned int bits)
    : stored_(stored), offset_(stored.light(0)), scale_(1 / (stored.light(1) - offset_)) {
    if (!(std::abs(offset_) <= kLargestOffset && std::abs(stored.light(1) - 1) <= kLargestOffset))
        throw App::Failure("has a curve that does not go from black to white");
    std::size_t const steps = 2 * ((std::size_t{1} << bits) - 1); // codes, and what lies between
    std::vector<double> samples;
    samples.reserve(steps + 1);
    for (std::size_t i = 0; i <= steps; ++i)
        samples.push_back(decode(static_cast<double>(i) / static_cast<double>(steps)));
    if (IsDistinct(samples))
        return;
    Level(samples);
    Incline(samples);
    if (!IsDistinct(samples))
        throw App::Failure("has a curve that is flat where codes differ");
    repaired_ = std::move(samples);
}

double ToneCurve::decode(double code) const {
    if (!repaired_.empty())
        return Interpolated(repaired_, code);
    return (stored_.light(code) - offset_) * scale_;
}

bool ToneCurve::isLinear() const {
    return stored_ == PowerCurve(1);
}

std::vector<float> ToneCurve::lights(unsigned int bits) const {
    std::size_t const last = (std::size_t{1} << bits) - 1;
    std::vector<float> lights;
    lights.reserve(last + 1);
    for (std::size_t code = 0; code <= last; ++code)
        lights.push_back(
            static_cast<float>(decode(static_cast<double>(code) / static_cast<double>(last))));
    return lights;
}

std::vector<float> ToneCurve::thresholds(unsigned int bits) const {
    std::size_t const last = (std::size_t{1} << bits) - 1;
    std::vector<float> thresholds;
    thresholds.reserve(last);
    for (std::size_t code = 0; code < last; ++code)
        thresholds.push_back(
            FloatNotBelow(decode((static_cast<double>(code) + 0.5) / static_cast<double>(last))));
    return thresholds;
}

} // namespace Develop
