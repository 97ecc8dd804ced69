// How many bits each channel of a window's buffers has.
#include "oru/oru_ogl/ogl/bufferformat.h"

#include "oru/core/exceptions/checks.h"

namespace ORU::OGL {

namespace {

/// Colour bits of the predefined formats; each comes without depth, with depth 24, and with
/// depth 24 and stencil 8, in this order.
struct Colour {
    unsigned int red, green, blue, alpha;
    bool floatingPoint;
};

Colour const kColours[] = {
    {16, 0, 0, 0, true}, {32, 0, 0, 0, true}, {16, 16, 0, 0, true},   {32, 32, 0, 0, true},
    {8, 8, 8, 0, false}, {8, 8, 8, 8, false}, {16, 16, 16, 16, true}, {16, 16, 16, 16, true},
};

BufferFormat Predefined(unsigned int format) {
    if (format > BufferFormat::FORMAT_RGBA16F_B_D24S8)
        ORU_THROW_INTERNAL("Trying to construct an buffer-format not recognized by this method");
    Colour const &colour = kColours[format / 3];
    unsigned int const variant = format % 3;
    return BufferFormat(colour.red, colour.green, colour.blue, colour.alpha, variant == 2 ? 8 : 0,
                        variant >= 1 ? 24 : 0, colour.floatingPoint);
}

} // namespace

BufferFormat::BufferFormat(PredefinedFormat format)
    : BufferFormat(Predefined(static_cast<unsigned int>(format))) {}

} // namespace ORU::OGL
