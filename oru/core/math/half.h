// Half-precision floating-point numbers.
#pragma once

#include "oru/core/utility/export.h"

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <iosfwd>

namespace ORU {

/// An IEEE 754 binary16 number, stored in its 16 bits and computed with in single precision.
///
/// Conversion from float rounds to nearest with ties away from zero, keeps no sign of a result that
/// becomes zero, and turns what is too large into infinity. For whole rows see
/// `oru/core/math/halfrow.h`.
class ORU_API half {
public:
    half() = default; ///< 0
    /// Rounds as said above; implicit, as from float to double.
    half(float f) : bits_(Convert(f)) {}

    half &operator=(float f) {
        bits_ = Convert(f);
        return *this;
    }

    /// The exact value.
    operator float() const {
        std::uint32_t const bits = toFloat(bits_);
        float f;
        std::memcpy(&f, &bits, sizeof f);
        return f;
    }

    /// The sign bit flipped, also of a zero or a NaN.
    half operator-() const { return FromBits(static_cast<std::uint16_t>(bits_ ^ 0x8000)); }

    /// @name Arithmetic
    /// Computed in single precision, then converted.
    /// @{
    half &operator+=(half other) { return *this = float(*this) + float(other); }
    half &operator-=(half other) { return *this = float(*this) - float(other); }
    half &operator*=(half other) { return *this = float(*this) * float(other); }
    half &operator/=(half other) { return *this = float(*this) / float(other); }
    half &operator+=(float other) { return *this = float(*this) + other; }
    half &operator-=(float other) { return *this = float(*this) - other; }
    half &operator*=(float other) { return *this = float(*this) * other; }
    half &operator/=(float other) { return *this = float(*this) / other; }
    /// @}

    /// Keeps `n` fraction bits, rounded to nearest with ties away from zero; truncates instead
    /// where rounding would reach infinity.
    half round(unsigned n) const;

    /// @name Classes of IEEE 754
    /// Finite: neither infinity nor NaN. Normalized: a full fraction, so neither zero nor
    /// denormalized. Denormalized: below 2^-14 in size and not zero.
    /// @{
    bool isFinite() const { return exponent() != 31; }
    bool isNormalized() const { return exponent() != 0 && exponent() != 31; }
    bool isDenormalized() const { return exponent() == 0 && fraction() != 0; }
    bool isZero() const { return (bits_ & 0x7FFF) == 0; }
    bool isNan() const { return exponent() == 31 && fraction() != 0; }
    bool isInfinity() const { return (bits_ & 0x7FFF) == 0x7C00; }
    /// @}
    /// The sign bit; true also for -0 and negative NaNs.
    bool isNegative() const { return (bits_ & 0x8000) != 0; }

    /// @name Special values
    /// Plus and minus infinity, and a quiet and a signalling NaN (bits 0x7C00, 0xFC00, 0x7FFF and
    /// 0x7DFF).
    /// @{
    static half posInf() { return FromBits(0x7C00); }
    static half negInf() { return FromBits(0xFC00); }
    static half qNan() { return FromBits(0x7FFF); }
    static half sNan() { return FromBits(0x7DFF); }
    /// @}

    /// The 16 bits: sign, 5 of the exponent, 10 of the fraction.
    unsigned short bits() const { return bits_; }
    void setBits(unsigned short bits) { bits_ = bits; } ///< Any bits are a value.

private:
    /// Both tables follow a rule, so they are filled when the library is loaded: that takes a
    /// fraction of a millisecond, where 66,048 constants would burden every build.
    struct Tables {
        Tables();
        std::uint32_t widening[65536]; ///< the binary32 bits of every binary16 value
        std::uint16_t exponent[512];   ///< by a float's top nine bits; 0 where it is no simple case
    };
    static Tables const sTables_;

    static std::uint32_t toFloat(std::size_t bits) { return sTables_.widening[bits]; }
    static std::uint16_t eLut(std::size_t signAndExponent) {
        return sTables_.exponent[signAndExponent];
    }

    static std::uint16_t Convert(float f) {
        if (f == 0)
            return 0;
        std::uint32_t x;
        std::memcpy(&x, &f, sizeof x);
        if (unsigned const e = eLut(x >> 23))
            // Half of the last kept place added before the cut rounds; a carry raises the exponent.
            return static_cast<std::uint16_t>(e + (((x & 0x7FFFFF) + 0x1000) >> 13));
        return static_cast<std::uint16_t>(convert(static_cast<int>(x)));
    }

    static half FromBits(std::uint16_t bits) {
        half h;
        h.bits_ = bits;
        return h;
    }

    static int convert(int floatBits);
    static float overflow();

    unsigned exponent() const { return (bits_ >> 10) & 31u; }
    unsigned fraction() const { return bits_ & 0x3FFu; }

    std::uint16_t bits_ = 0;
};

/// Writes the value as a float.
ORU_API std::ostream &operator<<(std::ostream &os, half h);

/// Reads a float and converts it.
ORU_API std::istream &operator>>(std::istream &is, half &h);

} // namespace ORU
