// Half-precision floating-point numbers.
#include "oru/core/math/half.h"

#include <istream>
#include <ostream>

namespace ORU {

namespace {

/// The binary32 bits of a binary16 value (IEEE 754, 3.4 and 3.6): the exponent's bias grows from 15
/// to 127, the fraction from 10 to 23 bits.
std::uint32_t Widen(std::uint32_t bits) {
    std::uint32_t const sign = (bits & 0x8000) << 16;
    std::uint32_t exponent = (bits >> 10) & 31;
    std::uint32_t fraction = bits & 0x3FF;
    if (exponent == 31)
        return sign | 0x7F800000 | (fraction << 13);
    if (exponent == 0) {
        if (fraction == 0)
            return sign;
        exponent = 1;
        while (!(fraction & 0x400)) { // a denormal is normal in the wider format
            fraction <<= 1;
            --exponent;
        }
        fraction &= 0x3FF;
    }
    return sign | ((exponent + 112) << 23) | (fraction << 13);
}

} // namespace

half::Tables const half::sTables_;

half::Tables::Tables() {
    for (std::uint32_t bits = 0; bits < 65536; ++bits)
        widening[bits] = Widen(bits);
    for (int i = 0; i < 256; ++i) {
        int const e = i - 112;
        bool const isSimple = 0 < e && e < 30;
        exponent[i] = static_cast<std::uint16_t>(isSimple ? e << 10 : 0);
        exponent[i + 256] = static_cast<std::uint16_t>(isSimple ? (e << 10) | 0x8000 : 0);
    }
}

int half::convert(int floatBits) {
    auto const x = static_cast<std::uint32_t>(floatBits);
    int const sign = static_cast<int>((x >> 16) & 0x8000);
    int const biased = static_cast<int>((x >> 23) & 0xFF);
    int e = biased - 112;
    int m = static_cast<int>(x & 0x7FFFFF);

    if (e <= 0) {
        if (e < -10)
            return 0;
        m = (m | 0x800000) >> (1 - e);
        if (m & 0x1000)
            m += 0x2000;
        return sign | (m >> 13);
    }
    if (biased == 255) {
        if (m == 0)
            return sign | 0x7C00;
        m >>= 13;
        return sign | 0x7C00 | m | (m == 0 ? 1 : 0); // a NaN stays one
    }
    if (m & 0x1000) {
        m += 0x2000;
        if (m & 0x800000) {
            m = 0;
            ++e;
        }
    }
    if (e > 30) {
        overflow();
        return sign | 0x7C00;
    }
    return sign | (e << 10) | (m >> 13);
}

/// Raises the floating-point overflow flag, as a conversion by hardware would. Products raise it in
/// the unit that computes, where `std::feraiseexcept` of this target reaches the x87's flags only.
float half::overflow() {
    float volatile f = 1e10f;
    for (int i = 0; i < 10; ++i)
        f = f * f;
    return f;
}

half half::round(unsigned n) const {
    if (n >= 10)
        return *this;
    unsigned const sign = bits_ & 0x8000u;
    unsigned a = bits_ & 0x7FFFu;
    a >>= 9 - n;
    a += a & 1;
    a <<= 9 - n;
    if (a >= 0x7C00)
        a = static_cast<unsigned>(bits_) >> (10 - n) << (10 - n);
    return FromBits(static_cast<std::uint16_t>(a | sign));
}

std::ostream &operator<<(std::ostream &os, half h) {
    return os << float(h);
}

std::istream &operator>>(std::istream &is, half &h) {
    float f = 0; // a stream that has already failed or ended does not set it
    is >> f;
    h = half(f);
    return is;
}

} // namespace ORU
