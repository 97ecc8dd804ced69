// The usual text of a floating-point number, quickly.
#include "oru/oru_ogl/extensionator/internal/floattext.h"

#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstring>

namespace ORU::OGL::internal {

namespace {

constexpr int kDigits = 6;
constexpr std::uint64_t kDigitsLimit = 1000000; // the least number of more digits
constexpr int kMantissaBits = 24;
constexpr int kExponentBias = 127 + kMantissaBits - 1; // of the mantissa as a whole number

// A float is m * 2^e with m below 2^24. From 1e-7 to below 1e19 all it takes to find its digits
// fits 64 bits: the largest factor is 10^12, for the smallest numbers.
constexpr int kLeastPower = -7;
constexpr double kLeast = 1e-7;
constexpr double kLimit = 1e19;

constexpr std::uint64_t kPowers[] = {
    1,        10,        100,        1000,        10000,        100000,        1000000,
    10000000, 100000000, 1000000000, 10000000000, 100000000000, 1000000000000, 10000000000000};

// No float lies between a power of ten and the double next to it, so comparisons with these are
// exact.
constexpr double kThresholds[] = {1e-7, 1e-6, 1e-5, 1e-4, 1e-3, 1e-2, 1e-1, 1e0,  1e1,
                                  1e2,  1e3,  1e4,  1e5,  1e6,  1e7,  1e8,  1e9,  1e10,
                                  1e11, 1e12, 1e13, 1e14, 1e15, 1e16, 1e17, 1e18, 1e19};

/// numerator / denominator to the nearest whole number, a tie to the even one.
std::uint64_t RoundedQuotient(std::uint64_t numerator, std::uint64_t denominator) {
    std::uint64_t const quotient = numerator / denominator;
    std::uint64_t const rest = numerator - quotient * denominator;
    std::uint64_t const missing = denominator - rest;
    bool const up = rest > missing || (rest == missing && quotient % 2 != 0);
    return up ? quotient + 1 : quotient;
}

/// A number in decimal scientific notation: digits[0].digits[1…] * 10^power.
struct Decimal {
    char digits[kDigits];
    int count; // without the zeros at the end
    int power;
};

/// @param value in the range above
Decimal ToDecimal(float value) {
    std::uint32_t bits;
    static_assert(sizeof bits == sizeof value, "a float has 32 bits");
    std::memcpy(&bits, &value, sizeof bits);
    std::uint64_t const hiddenBit = std::uint64_t(1) << (kMantissaBits - 1);
    std::uint64_t const mantissa = (bits & (hiddenBit - 1)) | hiddenBit;
    int const exponent = static_cast<int>(bits >> (kMantissaBits - 1)) - kExponentBias;

    // 1233 / 4096 is log10(2) closely enough: with the binary exponent alone the power is right or
    // one too small.
    Decimal result;
    result.power = ((exponent + kMantissaBits - 1) * 1233 >> 12);
    if (static_cast<double>(value) >= kThresholds[result.power + 1 - kLeastPower])
        ++result.power;

    int const shift = kDigits - 1 - result.power; // of the decimal point
    std::uint64_t const numerator = (shift > 0 ? mantissa * kPowers[shift] : mantissa)
                                    << (exponent > 0 ? exponent : 0);
    std::uint64_t const denominator = (shift < 0 ? kPowers[-shift] : 1)
                                      << (exponent < 0 ? -exponent : 0);
    std::uint64_t digits = RoundedQuotient(numerator, denominator);
    if (digits == kDigitsLimit) {
        digits /= 10;
        ++result.power;
    }
    result.count = 0;
    for (int i = kDigits; i-- > 0; digits /= 10) {
        auto const digit = static_cast<int>(digits % 10);
        result.digits[i] = static_cast<char>('0' + digit);
        if (digit != 0 && result.count == 0)
            result.count = i + 1;
    }
    return result;
}

char *Append(char *out, char const *text, int count) {
    std::memcpy(out, text, static_cast<std::size_t>(count));
    return out + count;
}

char *WriteDecimal(char *out, Decimal const &number) {
    char const *const digits = number.digits;
    int const power = number.power;
    if (power < -4 || power >= kDigits) {
        *out++ = digits[0];
        if (number.count > 1) {
            *out++ = '.';
            out = Append(out, digits + 1, number.count - 1);
        }
        int const magnitude = power < 0 ? -power : power;
        *out++ = 'e';
        *out++ = power < 0 ? '-' : '+';
        *out++ = static_cast<char>('0' + magnitude / 10);
        *out++ = static_cast<char>('0' + magnitude % 10);
        return out;
    }
    if (power < 0) {
        out = Append(out, "0.000", 1 - power);
        return Append(out, digits, number.count);
    }
    out = Append(out, digits, power + 1);
    if (number.count > power + 1) {
        *out++ = '.';
        out = Append(out, digits + power + 1, number.count - power - 1);
    }
    return out;
}

} // namespace

char *WriteNumber(char *out, double value) {
    double const magnitude = std::fabs(value);
    if (magnitude < static_cast<double>(kDigitsLimit)) {
        // Whole numbers, which most are in traces, show as they are. Negative zero has a sign to
        // write.
        auto const whole = static_cast<int>(value);
        if (static_cast<double>(whole) == value && (whole != 0 || !std::signbit(value)))
            return std::to_chars(out, out + kNumberRoom, whole).ptr;
    }
    bool const isFloat = magnitude >= kLeast && magnitude < kLimit &&
                         static_cast<double>(static_cast<float>(magnitude)) == magnitude;
    if (!isFloat)
        return std::to_chars(out, out + kNumberRoom, value, std::chars_format::general, kDigits)
            .ptr;
    if (value < 0)
        *out++ = '-';
    return WriteDecimal(out, ToDecimal(static_cast<float>(magnitude)));
}

} // namespace ORU::OGL::internal
