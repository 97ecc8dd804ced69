// Pictures that tests make, and the arithmetic of developing in double precision.
#pragma once

#include "apps/common/image.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <random>

namespace apps_test {

/// Stored values by pixel and channel, whatever their size.
inline unsigned int Value(App::Image const &image, std::size_t index) {
    if (image.bitsPerChannel == 8)
        return image.pixels[index];
    std::uint16_t value;
    std::memcpy(&value, image.pixels.data() + 2 * index, 2);
    return value;
}

inline void SetValue(App::Image &image, std::size_t index, unsigned int value) {
    if (image.bitsPerChannel == 8) {
        image.pixels[index] = static_cast<unsigned char>(value);
        return;
    }
    auto const value16 = static_cast<std::uint16_t>(value);
    std::memcpy(image.pixels.data() + 2 * index, &value16, 2);
}

inline std::size_t ValueCount(App::Image const &image) {
    return image.width * image.height * image.channels;
}

inline double Levels(App::Shape const &shape) {
    return shape.bitsPerChannel == 8 ? 255 : 65535;
}

inline bool IsAlpha(App::Shape const &shape, std::size_t index) {
    return shape.hasAlpha() && index % shape.channels == shape.channels - 1;
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
    std::size_t const pixels = image.width * image.height;
    for (std::size_t i = 0; i < ValueCount(image); ++i)
        SetValue(image, i,
                 static_cast<unsigned int>(i / channels * (2 * (i % channels) + 1) % pixels));
    return image;
}

inline double DecodeSRGB(double code) {
    return code <= 0.04045 ? code / 12.92 : std::pow((code + 0.055) / 1.055, 2.4);
}

inline double EncodeSRGB(double light) {
    return light <= 0.0031308 ? 12.92 * light : 1.055 * std::pow(light, 1 / 2.4) - 0.055;
}

/// A stored value developed: to light, brightened, clamped, and back.
inline double Developed(double value, double stops, double levels) {
    double const light = DecodeSRGB(value / levels) * std::exp2(stops);
    return std::round(EncodeSRGB(std::clamp(light, 0.0, 1.0)) * levels);
}

/// The largest difference of the developed colours from the exact ones; alpha that differs at all
/// counts as everything.
inline double WorstError(App::Image const &original, App::Image const &developed, double stops) {
    if (original != static_cast<App::Shape const &>(developed))
        return 1e9;
    double worst = 0;
    for (std::size_t i = 0; i < ValueCount(original); ++i) {
        double const before = Value(original, i);
        double const after = Value(developed, i);
        if (!IsAlpha(original, i))
            worst = std::max(worst, std::abs(after - Developed(before, stops, Levels(original))));
        else if (before != after)
            return 1e9;
    }
    return worst;
}

/// What is promised: 1 of 255, 16 of 65,535.
inline double Tolerance(App::Shape const &shape) {
    return shape.bitsPerChannel == 8 ? 1 : 16;
}

} // namespace apps_test
