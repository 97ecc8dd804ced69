// Translation between the library's enumerations, which count from 0, and OpenCL's constants.
#pragma once

#include <algorithm>
#include <cstddef>
#include <iterator>

namespace ORU::OCL {

/// The constant at index `value`, or `otherwise` when the table has none.
template<class Constant, std::size_t Size>
constexpr Constant ConstantOr(Constant const (&table)[Size], int value, Constant otherwise) {
    return static_cast<std::size_t>(value) < Size ? table[value] : otherwise;
}

/// The index of `constant`, or the table's size when it is not there.
template<class Constant, std::size_t Size>
int IndexOf(Constant const (&table)[Size], Constant constant) {
    return static_cast<int>(
        std::distance(std::begin(table), std::find(std::begin(table), std::end(table), constant)));
}

} // namespace ORU::OCL
