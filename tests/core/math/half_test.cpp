// Half floats against the arithmetic of their format, and the conversion of rows against the class.
#include "oru/core/math/halfrow.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cfenv>
#include <cmath>
#include <random>
#include <sstream>

using ORU::half;

namespace {

half Half(unsigned bits) {
    half h;
    h.setBits(static_cast<unsigned short>(bits));
    return h;
}

// Bits travel in floats only by memcpy: a signalling NaN passed by value may turn quiet.
std::uint32_t Bits(float const &f) {
    std::uint32_t bits;
    std::memcpy(&bits, &f, sizeof bits);
    return bits;
}

void SetBits(float &f, std::uint32_t bits) {
    std::memcpy(&f, &bits, sizeof bits);
}

/// The value of a finite half by the definition of the format: fraction times a power of two.
double ValueOf(unsigned bits) {
    int const exponent = static_cast<int>((bits >> 10) & 31);
    int const fraction = static_cast<int>(bits & 0x3FF);
    double const size =
        exponent == 0 ? std::ldexp(fraction, -24) : std::ldexp(1024 + fraction, exponent - 25);
    return bits & 0x8000 ? -size : size;
}

/// The half that a float becomes, found by value and not by bits: one more for every middle between
/// neighbours that its size reaches. By the definition infinity follows the largest as 65536.
unsigned Expected(std::uint32_t bits) {
    static std::vector<double> sMiddles;
    for (auto h = static_cast<unsigned>(sMiddles.size()); h < 0x7C00; ++h)
        sMiddles.push_back((ValueOf(h) + ValueOf(h + 1)) / 2);
    float f;
    SetBits(f, bits);
    unsigned const sign = (bits >> 16) & 0x8000;
    if (std::isnan(f)) // the upper fraction bits stay; a NaN that has none gets the lowest
        return sign | 0x7C00 | std::max((bits & 0x7FFFFF) >> 13, 1u);
    auto const reached = std::upper_bound(sMiddles.begin(), sMiddles.end(), std::fabs(f));
    auto const half = static_cast<unsigned>(reached - sMiddles.begin());
    return half == 0 ? 0 : sign | half; // the sign goes where nothing of the value remains
}

TEST(Half, WidensAllValuesExactly) {
    std::vector<half> halves;
    for (unsigned bits = 0; bits < 65536; ++bits)
        halves.push_back(Half(bits));
    std::vector<float> row(halves.size());
    ORU::HalfToFloat(halves.data(), row.data(), row.size());
    for (unsigned bits = 0; bits < 65536; ++bits) {
        half const h = halves[bits];
        bool const special = (bits & 0x7C00) == 0x7C00;
        std::uint32_t const wide = special
                                       ? (bits & 0x8000) << 16 | 0x7F800000 | (bits & 0x3FF) << 13
                                       : Bits(static_cast<float>(ValueOf(bits)));
        float const f[1] = {h};
        ASSERT_EQ(Bits(f[0]), wide) << bits;
        ASSERT_EQ(Bits(row[bits]), wide) << bits;

        double const size = special ? 0 : std::fabs(ValueOf(bits));
        bool const isNormal = size >= std::ldexp(1, -14);
        ASSERT_EQ(h.isNan(), special && (bits & 0x3FF)) << bits;
        ASSERT_EQ(h.isInfinity(), special && !h.isNan()) << bits;
        ASSERT_EQ(h.isZero(), !special && size == 0) << bits;
        ASSERT_EQ(h.isDenormalized(), size > 0 && !isNormal) << bits;
        ASSERT_EQ(h.isNormalized(), isNormal) << bits;
        ASSERT_EQ(h.isNegative(), bits >= 0x8000) << bits;
        ASSERT_EQ((-h).bits(), bits ^ 0x8000);
    }
}

// Every 251st float, and those at and beside each half and the middle to its neighbours. A row
// holds one value, as others that the vectors leave to the class would hide what they do to it.
TEST(Half, RoundsEveryClassOfFloats) {
    std::vector<float> floats(8);
    std::vector<half> row(8);
    auto const check = [&](std::uint32_t bits) {
        for (float &f : floats)
            SetBits(f, bits);
        ORU::FloatToHalf(floats.data(), row.data(), row.size());
        unsigned const expected = Expected(bits);
        // An assertion each would take most of the time.
        if (half(floats[0]).bits() != expected || row[0].bits() != expected)
            FAIL() << std::hex << bits << ": " << half(floats[0]).bits() << ", in a row "
                   << row[0].bits() << ", not " << expected;
    };
    for (std::uint64_t bits = 0; bits >> 32 == 0 && !HasFailure(); bits += 251)
        check(static_cast<std::uint32_t>(bits));
    for (unsigned h = 0; h < 65536 && !HasFailure(); ++h)
        for (int const place : {-0x1001, -0x1000, -0xFFF, -1, 0, 1, 0xFFF, 0x1000, 0x1001})
            check(Bits(Half(h)) + static_cast<std::uint32_t>(place));
}

TEST(Half, RaisesOverflowOnlyWhereItOverflows) {
    for (float const volatile f : {65519.0f, -65520.0f}) {
        std::feclearexcept(FE_ALL_EXCEPT);
        half const volatile h(f);
        static_cast<void>(h);
        EXPECT_EQ(std::fetestexcept(FE_OVERFLOW) != 0, f < 0);
    }
}

TEST(Half, KeepsAsManyFractionBitsAsAsked) {
    for (unsigned n = 0; n < 12; ++n)
        for (unsigned bits = 0; bits < 65536; ++bits) {
            // The bits of a half grow evenly with its value inside an exponent and across.
            unsigned const step = n < 10 ? 1u << (10 - n) : 1;
            unsigned const up = ((bits & 0x7FFF) + step / 2) / step * step;
            unsigned const down = bits / step * step;
            bool const isFinite = (bits & 0x7C00) != 0x7C00 && up < 0x7C00;
            ASSERT_EQ(Half(bits).round(n).bits(), isFinite ? up | (bits & 0x8000) : down)
                << n << ' ' << bits;
        }
}

TEST(Half, ComputesInSinglePrecision) {
    half h(2048.0f);
    EXPECT_EQ(h += half(1.0f), 2050.0f) << "2049 is a tie";
    EXPECT_EQ(h -= 2.0f, 2048.0f);
    EXPECT_EQ(h *= half(0.5f), 1024.0f);
    EXPECT_EQ(h /= 3.0f, half(1024.0f / 3));
    std::istringstream("0.5") >> h;
    EXPECT_EQ(testing::PrintToString(h), "0.5");
}

TEST(HalfRow, TouchesNothingButTheRow) {
    std::mt19937 random(3);
    std::vector<float> floats(128), back(128);
    std::vector<half> halves(128);
    for (int round = 0; round < 20000; ++round) {
        std::size_t const offset = random() % 9, count = random() % 100;
        for (float &f : floats) { // mostly values that the vectors take, few that they leave
            auto const bits = static_cast<std::uint32_t>(random());
            SetBits(f, random() % 32 ? (bits & 0x807FFFFF) | (113 + bits % 29) << 23 : bits);
        }
        std::fill(halves.begin(), halves.end(), Half(0x1234));
        std::fill(back.begin(), back.end(), 17.0f);
        ORU::FloatToHalf(&floats[offset], &halves[offset], count);
        ORU::HalfToFloat(&halves[offset], &back[offset], count);
        for (std::size_t i = 0; i < floats.size(); ++i) {
            bool const inside = i >= offset && i < offset + count;
            ASSERT_EQ(halves[i].bits(), inside ? half(floats[i]).bits() : 0x1234);
            ASSERT_EQ(Bits(back[i]), Bits(inside ? float(halves[i]) : 17.0f));
        }
    }
}

} // namespace
