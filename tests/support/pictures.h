// Pictures that tests make, and the arithmetic of developing in double precision.
#pragma once

#include "apps/common/image.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <random>

namespace apps_test {

/// Stored values by pixel and channel, whatever their size; the low byte comes first.
inline unsigned int Value(App::Image const &image, std::size_t index) {
    std::size_t const bytes = image.bitsPerChannel / 8;
    unsigned int value = 0;
    std::memcpy(&value, image.pixels.data() + bytes * index, bytes);
    return value;
}

inline std::size_t ValueCount(App::Image const &image) {
    return image.width * image.height * image.channels;
}

inline double Levels(App::Shape const &shape) {
    return shape.bitsPerChannel == 8 ? 255 : 65535;
}

inline App::Image RandomPicture(App::Shape const &shape, unsigned int seed) {
    std::mt19937 random(seed);
    App::Image image(shape);
    for (unsigned char &byte : image.pixels)
        byte = static_cast<unsigned char>(random());
    return image;
}

/// A picture whose pixels go through all the values, another order in each channel.
inline App::Image EveryValue(unsigned int channels, unsigned int bits) {
    App::Image image({256, bits == 8 ? 1u : 256u, channels, bits});
    for (std::size_t i = 0; i < ValueCount(image); ++i) {
        // Odd factors reach every value; what is more than the levels is not copied.
        std::size_t const value = i / channels * (2 * (i % channels) + 1);
        std::memcpy(image.pixels.data() + bits / 8 * i, &value, bits / 8);
    }
    return image;
}

/// The linear light that a stored value stands for.
inline double Light(App::Image const &image, std::size_t index) {
    double const code = Value(image, index) / Levels(image);
    return code <= 0.04045 ? code / 12.92 : std::pow((code + 0.055) / 1.055, 2.4);
}

/// The value that stands for an amount of light: clamped, encoded and rounded.
inline double Stored(double light, double levels) {
    light = std::clamp(light, 0.0, 1.0);
    double const code =
        light <= 0.0031308 ? 12.92 * light : 1.055 * std::pow(light, 1 / 2.4) - 0.055;
    return std::round(code * levels);
}

/// The largest difference of a developed picture from the exact light, which a function gives by
/// index. Alpha stays: any difference there counts as everything.
template<class ExactLight>
double WorstError(App::Image const &original, App::Image const &developed, ExactLight exactLight) {
    if (original != static_cast<App::Shape const &>(developed))
        return 1e9;
    double worst = 0;
    for (std::size_t i = 0; i < ValueCount(original); ++i) {
        bool const isAlpha = original.hasAlpha() && (i + 1) % original.channels == 0;
        double const error = isAlpha
                                 ? 1e9 * (Value(developed, i) - 1.0 * Value(original, i))
                                 : Value(developed, i) - Stored(exactLight(i), Levels(original));
        worst = std::max(worst, std::abs(error));
    }
    return worst;
}

/// The same of a picture that is only brightened.
inline double WorstError(App::Image const &original, App::Image const &developed, double stops) {
    return WorstError(original, developed,
                      [&](std::size_t i) { return Light(original, i) * std::exp2(stops); });
}

/// What is promised: 1 of 255, 16 of 65,535.
inline double Tolerance(App::Shape const &shape) {
    return shape.bitsPerChannel == 8 ? 1 : 16;
}

} // namespace apps_test
