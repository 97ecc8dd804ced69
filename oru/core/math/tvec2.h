// A small vector of two components.
#pragma once

namespace ambra {
namespace lumo {

/// Two values of `T`, stored one after the other with nothing else: points, offsets, kernel
/// arguments.
template<class T>
struct TVec2 {
    using value_type = T;

    /// Both components `T()`.
    constexpr TVec2() : x(), y() {}
    constexpr TVec2(T xValue, T yValue) : x(xValue), y(yValue) {}

    T x;
    T y;
};

static_assert(sizeof(TVec2<float>) == 2 * sizeof(float), "no padding");

} // namespace lumo
} // namespace ambra
