// Powers of two and multiples.
#pragma once

#include "oru/core/utility/export.h"

#include <cstddef>

namespace ORU {

/// Whether at most one bit of `x` is set, so also for 0.
ORU_API bool IsPowerOfTwo(unsigned x);

/// The smallest multiple of `boundary` that is not below `value`, for values from 0 on; a negative
/// value that is no multiple goes up by `boundary` less its (negative) remainder.
/// @param boundary not 0
ORU_API int IncrementToBoundary(int value, int boundary);

/// The same for sizes and addresses.
ORU_API std::size_t IncrementToBoundaryPtr(std::size_t value, int boundary);

} // namespace ORU
