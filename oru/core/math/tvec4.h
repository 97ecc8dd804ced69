// A small vector of four components.
#pragma once

namespace ambra {
namespace lumo {

/// Four values of `T`, stored one after the other with nothing else: colours, kernel arguments.
template<class T>
struct TVec4 {
    using value_type = T; ///< the components' type

    /// All components `T()`.
    constexpr TVec4() : x(), y(), z(), w() {}
    /// The components in order.
    constexpr TVec4(T xValue, T yValue, T zValue, T wValue)
        : x(xValue), y(yValue), z(zValue), w(wValue) {}

    T x; ///< first component, or red
    T y; ///< second component, or green
    T z; ///< third component, or blue
    T w; ///< fourth component, or alpha
};

static_assert(sizeof(TVec4<float>) == 4 * sizeof(float), "no padding");

} // namespace lumo
} // namespace ambra
