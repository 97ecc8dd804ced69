// The sizes of a kernel launch, and of the device property CL_DEVICE_MAX_WORK_ITEM_SIZES.
#pragma once

#include "oru/core/exceptions/checks.h"

#include <algorithm>
#include <array>
#include <cstddef>

namespace ORU::OCL {

/// `N` (1, 2 or 3) sizes, in work items.
template<unsigned int N>
class Range {
    static_assert(N >= 1 && N <= 3, "OpenCL ranges have one to three dimensions");

public:
    /// Leaves the sizes without a defined content.
    Range() = default;

    /// All sizes `v`; implicit, so that a launch takes a plain 0 for "no local size".
    Range(std::size_t v) { assign(v); }

    /// Two sizes.
    /// @throws InternalException "N==2" for another `N`
    Range(std::size_t x, std::size_t y) {
        ORU_ASSERT_TEXT("N==2", N == 2);
        set(x, y);
    }

    /// Three sizes.
    /// @throws InternalException "N==3" for another `N`
    Range(std::size_t x, std::size_t y, std::size_t z) {
        ORU_ASSERT_TEXT("N==3", N == 3);
        set(x, y, z);
    }

    /// Size `i`.
    /// @throws InternalException "i < range_.size()"
    std::size_t const &operator[](unsigned int i) const {
        ORU_ASSERT(i < range_.size());
        return range_[i];
    }
    /// Size `i`, to be written; failures as above.
    std::size_t &operator[](unsigned int i) {
        ORU_ASSERT(i < range_.size());
        return range_[i];
    }

    /// `N`.
    constexpr std::size_t size() const { return N; }
    constexpr std::size_t dimensions() const { return N; } ///< `N`

    /// Sets all sizes to `v`.
    void assign(std::size_t const &v) { range_.fill(v); }

    /// @name Iteration
    /// Over the sizes.
    /// @{
    std::size_t *begin() { return range_.data(); }
    std::size_t *end() { return range_.data() + N; }
    std::size_t const *begin() const { return range_.data(); }
    std::size_t const *end() const { return range_.data() + N; }
    /// @}

private:
    template<class... Values>
    void set(Values... values) {
        // The check before leaves only the case of as many values as there are sizes.
        if constexpr (sizeof...(Values) == N)
            range_ = {{values...}};
    }

    std::array<std::size_t, N> range_;
};

/// Whether all sizes are equal.
template<unsigned int N>
bool operator==(Range<N> const &a, Range<N> const &b) {
    return &a == &b || std::equal(a.begin(), a.end(), b.begin());
}

/// Not `==`.
template<unsigned int N>
bool operator!=(Range<N> const &a, Range<N> const &b) {
    return !(a == b);
}

} // namespace ORU::OCL
