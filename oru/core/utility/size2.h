// A pair of sizes: width and height.
#pragma once

#include "oru/core/utility/export.h"

#include <cstddef>
#include <iosfwd>

namespace ORU {

/// Two unsigned 64-bit sizes, (width, height) throughout the library.
struct size2 {
    /// How many components there are.
    // NOLINTNEXTLINE(readability-identifier-naming): hosts see it
    static constexpr std::size_t dimension = 2;

    constexpr size2(std::size_t v = 0) : values_{v, v} {}            ///< both `v`; implicit
    constexpr size2(std::size_t a, std::size_t b) : values_{a, b} {} ///< (a, b)

    /// One of the two sizes.
    /// @param i 0 or 1
    constexpr std::size_t operator[](std::size_t i) const { return values_[i]; }
    constexpr std::size_t &operator[](std::size_t i) { return values_[i]; } ///< to be written

    /// @name Iteration
    /// Over the two components.
    /// @{
    constexpr std::size_t *begin() { return values_; }
    constexpr std::size_t const *begin() const { return values_; }
    constexpr std::size_t *end() { return values_ + dimension; }
    constexpr std::size_t const *end() const { return values_ + dimension; }
    /// @}

private:
    std::size_t values_[dimension];
};

/// Equal in both components.
constexpr bool operator==(size2 const &a, size2 const &b) {
    return a[0] == b[0] && a[1] == b[1];
}
/// Not `==`.
constexpr bool operator!=(size2 const &a, size2 const &b) {
    return !(a == b);
}

/// Lexicographic: the heights count only between equal widths.
constexpr bool operator<(size2 const &a, size2 const &b) {
    return a[0] != b[0] ? a[0] < b[0] : a[1] < b[1];
}

/// @name Arithmetic
/// Component by component, modulo 2^64; a divisor's components must not be 0.
/// @{

constexpr size2 &operator+=(size2 &a, size2 const &b) {
    return a = size2(a[0] + b[0], a[1] + b[1]);
}
constexpr size2 &operator*=(size2 &a, size2 const &b) {
    return a = size2(a[0] * b[0], a[1] * b[1]);
}
constexpr size2 &operator/=(size2 &a, size2 const &b) {
    return a = size2(a[0] / b[0], a[1] / b[1]);
}
constexpr size2 &operator%=(size2 &a, size2 const &b) {
    return a = size2(a[0] % b[0], a[1] % b[1]);
}
constexpr size2 operator+(size2 a, size2 const &b) {
    return a += b;
}
constexpr size2 operator*(size2 a, size2 const &b) {
    return a *= b;
}
constexpr size2 operator/(size2 a, size2 const &b) {
    return a /= b;
}
constexpr size2 operator%(size2 a, size2 const &b) {
    return a %= b;
}
/// @}

/// Writes "(width, height)".
ORU_API std::ostream &operator<<(std::ostream &os, size2 const &size);

} // namespace ORU
