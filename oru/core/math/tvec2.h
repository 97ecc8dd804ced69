// A small vector of two components.
#pragma once

/// Holds `ambra::lumo`.
namespace ambra {
/// The small vectors.
namespace lumo {

/// Two values of `T`, stored one after the other with nothing else: points, offsets, kernel
/// arguments.
template<class T>
struct TVec2 {
    using value_type = T; ///< the components' type

    /// Both components `T()`.
    constexpr TVec2() : x(), y() {}
    /// The components in order.
    constexpr TVec2(T xValue, T yValue) : x(xValue), y(yValue) {}

    T x; ///< first component, across
    T y; ///< second component, down or up
};

static_assert(sizeof(TVec2<float>) == 2 * sizeof(float), "no padding");

} // namespace lumo
} // namespace ambra
