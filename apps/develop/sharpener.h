// The sharpening of a picture in linear light.
#pragma once

#include "oru/oru_ogl/ogl/texture2.h"

#include <cstddef>
#include <string>

namespace Develop {

/// An unsharp mask: each colour v becomes max(0, v + amount × (v − G(v))), where G is the Gaussian
/// blur. Edges are continued by their outermost pixels; alpha stays.
struct Sharpening {
    double amount = 0;
    double sigma = 1; ///< standard deviation of the blur in pixels, 0.3 to 20

    bool isOn() const { return amount != 0; }
};

/// One way of doing it on textures.
class Sharpener {
public:
    virtual ~Sharpener() = default;
    Sharpener(Sharpener const &) = delete;
    Sharpener &operator=(Sharpener const &) = delete;

    /// The texture of linear light to sharpen, of the format kLightFormat, to be drawn into.
    /// @param width, height that it has at least
    virtual ORU::OGL::Texture2D &light(std::size_t width, std::size_t height) = 0;

    /// Sharpens the rectangle at the beginning of what `light` gave; no texture may be bound.
    /// @param channels of the picture that it holds, which tells where alpha is
    /// @return the texture that holds the result until the next call
    virtual ORU::OGL::Texture2D const &sharpen(std::size_t width, std::size_t height,
                                               std::size_t channels,
                                               Sharpening const &sharpening) = 0;

    /// Which way it is and on what it runs, for people.
    virtual std::string description() const = 0;

protected:
    Sharpener() = default;
};

} // namespace Develop
