// How many bits each channel of a window's buffers has.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/oru_ogl/contextattributes.h"

namespace ORU::OGL {

/// Bits per channel of a drawable, from which a context chooses its pixel format.
class ORU_API BufferFormat {
public:
    /// Named by colour channels and their bits (F: floating point), D depth bits, S stencil bits.
    enum PredefinedFormat {
        FORMAT_R16F = 0,
        FORMAT_R16F_D24,
        FORMAT_R16F_D24S8,
        FORMAT_R32F,
        FORMAT_R32F_D24,
        FORMAT_R32F_D24S8,
        FORMAT_RG16F,
        FORMAT_RG16F_D24,
        FORMAT_RG16F_D24S8,
        FORMAT_RG32F,
        FORMAT_RG32F_D24,
        FORMAT_RG32F_D24S8,
        FORMAT_RGB8,
        FORMAT_RGB8_D24,
        FORMAT_RGB8_D24S8,
        FORMAT_RGBA8,
        FORMAT_RGBA8_D24,
        FORMAT_RGBA8_D24S8,
        FORMAT_RGBA16F,
        FORMAT_RGBA16F_D24,
        FORMAT_RGBA16F_D24S8,
        FORMAT_RGBA16F_B, ///< equal to FORMAT_RGBA16F, likewise the two below
        FORMAT_RGBA16F_B_D24,
        FORMAT_RGBA16F_B_D24S8
    };

    /// Bits of each channel; mind the order: stencil before depth.
    BufferFormat(unsigned int red, unsigned int green, unsigned int blue, unsigned int alpha,
                 unsigned int stencil, unsigned int depth, bool floatingPointColor)
        : red_(red), green_(green), blue_(blue), alpha_(alpha), stencil_(stencil), depth_(depth),
          floatingPointColor_(floatingPointColor) {}

    /// @throws InternalException for a value that is no enumerator
    BufferFormat(PredefinedFormat format);

    unsigned int redBits() const { return red_; }
    unsigned int greenBits() const { return green_; }
    unsigned int blueBits() const { return blue_; }
    unsigned int alphaBits() const { return alpha_; }
    unsigned int stencilBits() const { return stencil_; }
    unsigned int depthBits() const { return depth_; }

    /// Whether the colour channels are floating point.
    bool floatingPointColor() const { return floatingPointColor_; }

    /// What the context is asked for besides; where nothing is set, what the init options say.
    ContextAttributes contextAttributes() const { return contextAttributes_; }
    BufferFormat &setContextAttributes(ContextAttributes attributes) {
        contextAttributes_ = attributes;
        return *this;
    }

private:
    unsigned int red_;
    unsigned int green_;
    unsigned int blue_;
    unsigned int alpha_;
    unsigned int stencil_;
    unsigned int depth_;
    bool floatingPointColor_;
    ContextAttributes contextAttributes_; // where padding was
};
static_assert(sizeof(BufferFormat) == 28, "Hosts know its size.");

} // namespace ORU::OGL
