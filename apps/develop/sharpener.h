// The sharpening of a picture in linear light.
#pragma once

#include "oru/oru_ogl/ogl/texture2.h"

#include <cstddef>
#include <memory>
#include <string>

namespace Develop {

/// An unsharp mask: each colour v becomes max(0, v + amount × (v − G(v))), where G is the Gaussian
/// blur. Edges are continued by their outermost pixels; alpha stays.
struct Sharpening {
    double amount = 0;
    double sigma = 1; ///< standard deviation of the blur in pixels, 0.3 to 20

    bool isOn() const { return amount != 0; }
};

/// One way of doing it.
class Sharpener {
public:
    virtual ~Sharpener() = default;
    Sharpener(Sharpener const &) = delete;
    Sharpener &operator=(Sharpener const &) = delete;

    /// Sharpens a texture of linear light, or puts a sharpened one in its place.
    /// @param light of the format kLightFormat, not bound
    /// @param channels of the picture that it holds, which tells where alpha is
    virtual void sharpen(std::unique_ptr<ORU::OGL::Texture2D> &light, std::size_t channels,
                         Sharpening const &sharpening) = 0;

    /// Which way it is and on what it runs, for people.
    virtual std::string description() const = 0;

protected:
    Sharpener() = default;
};

} // namespace Develop
