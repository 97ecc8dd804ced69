// Powers of two and multiples.
#pragma once

#include <cstddef>

namespace ORU {

/// Whether at most one bit of `x` is set, so also for 0.
constexpr bool IsPowerOfTwo(unsigned x) {
    return (x & (x - 1)) == 0;
}

/// The smallest multiple of `boundary` that is not below `value`, for values from 0 on; a negative
/// value that is no multiple goes up by `boundary` less its (negative) remainder.
/// @param boundary not 0
constexpr int IncrementToBoundary(int value, int boundary) {
    int const remainder = value % boundary;
    return remainder == 0 ? value : value + boundary - remainder;
}

/// The same for sizes and addresses.
constexpr std::size_t IncrementToBoundaryPtr(std::size_t value, int boundary) {
    // Widened as the signed number that it is.
    auto const wide = static_cast<std::size_t>(static_cast<long long>(boundary));
    std::size_t const remainder = value % wide;
    return remainder == 0 ? value : value + wide - remainder;
}

} // namespace ORU
