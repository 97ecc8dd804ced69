// Powers of two and multiples.
#include "oru/core/utility/boundary.h"

namespace ORU {

bool IsPowerOfTwo(unsigned x) {
    return (x & (x - 1)) == 0;
}

int IncrementToBoundary(int value, int boundary) {
    int const remainder = value % boundary;
    return remainder == 0 ? value : value + boundary - remainder;
}

std::size_t IncrementToBoundaryPtr(std::size_t value, int boundary) {
    // Widened as the signed number that it is.
    auto const wide = static_cast<std::size_t>(static_cast<long long>(boundary));
    std::size_t const remainder = value % wide;
    return remainder == 0 ? value : value + wide - remainder;
}

} // namespace ORU
