// Conversion of whole rows between half and single precision.
#pragma once

#include "oru/core/math/half.h"
#include "oru/core/utility/export.h"

#include <cstddef>

namespace ORU {

/// Converts `count` values; each result is bit for bit what `float(half)` gives.
/// @param source, target rows of `count` values that do not overlap; any alignment
ORU_API void HalfToFloat(half const *source, float *target, std::size_t count);

/// Converts `count` values; each result is bit for bit what `half(float)` gives, with its ties away
/// from zero and its unsigned zeros.
/// @param source, target rows of `count` values that do not overlap; any alignment
ORU_API void FloatToHalf(float const *source, half *target, std::size_t count);

} // namespace ORU
