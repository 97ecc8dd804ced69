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
        FORMAT_R16F = 0,       ///< 1 channel of 16 floating-point bits
        FORMAT_R16F_D24,       ///< 1 channel of 16 floating-point bits, depth 24
        FORMAT_R16F_D24S8,     ///< 1 channel of 16 floating-point bits, depth 24, stencil 8
        FORMAT_R32F,           ///< 1 channel of 32 floating-point bits
        FORMAT_R32F_D24,       ///< 1 channel of 32 floating-point bits, depth 24
        FORMAT_R32F_D24S8,     ///< 1 channel of 32 floating-point bits, depth 24, stencil 8
        FORMAT_RG16F,          ///< 2 channels of 16 floating-point bits
        FORMAT_RG16F_D24,      ///< 2 channels of 16 floating-point bits, depth 24
        FORMAT_RG16F_D24S8,    ///< 2 channels of 16 floating-point bits, depth 24, stencil 8
        FORMAT_RG32F,          ///< 2 channels of 32 floating-point bits
        FORMAT_RG32F_D24,      ///< 2 channels of 32 floating-point bits, depth 24
        FORMAT_RG32F_D24S8,    ///< 2 channels of 32 floating-point bits, depth 24, stencil 8
        FORMAT_RGB8,           ///< 3 channels of 8 bits
        FORMAT_RGB8_D24,       ///< 3 channels of 8 bits, depth 24
        FORMAT_RGB8_D24S8,     ///< 3 channels of 8 bits, depth 24, stencil 8
        FORMAT_RGBA8,          ///< 4 channels of 8 bits
        FORMAT_RGBA8_D24,      ///< 4 channels of 8 bits, depth 24
        FORMAT_RGBA8_D24S8,    ///< 4 channels of 8 bits, depth 24, stencil 8
        FORMAT_RGBA16F,        ///< 4 channels of 16 floating-point bits
        FORMAT_RGBA16F_D24,    ///< 4 channels of 16 floating-point bits, depth 24
        FORMAT_RGBA16F_D24S8,  ///< 4 channels of 16 floating-point bits, depth 24, stencil 8
        FORMAT_RGBA16F_B,      ///< as FORMAT_RGBA16F
        FORMAT_RGBA16F_B_D24,  ///< as FORMAT_RGBA16F_D24
        FORMAT_RGBA16F_B_D24S8 ///< as FORMAT_RGBA16F_D24S8
    };

    /// Bits of each channel; mind the order: stencil before depth.
    BufferFormat(unsigned int red, unsigned int green, unsigned int blue, unsigned int alpha,
                 unsigned int stencil, unsigned int depth, bool floatingPointColor)
        : red_(red), green_(green), blue_(blue), alpha_(alpha), stencil_(stencil), depth_(depth),
          floatingPointColor_(floatingPointColor) {}

    /// One of the usual combinations; implicit.
    /// @throws InternalException for a value that is no enumerator
    BufferFormat(PredefinedFormat format);

    /// @name Bits of each channel
    /// 0 for a channel that there is not.
    /// @{
    unsigned int redBits() const { return red_; }
    unsigned int greenBits() const { return green_; }
    unsigned int blueBits() const { return blue_; }
    unsigned int alphaBits() const { return alpha_; }
    unsigned int stencilBits() const { return stencil_; }
    unsigned int depthBits() const { return depth_; }
    /// @}

    /// Whether the colour channels are floating point.
    bool floatingPointColor() const { return floatingPointColor_; }

    /// What the context is asked for besides; where nothing is set, what the init options say.
    ContextAttributes contextAttributes() const { return contextAttributes_; }
    /// Asks for a version, a profile or flags.
    /// @return this format, to go on with
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
