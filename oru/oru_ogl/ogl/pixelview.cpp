// Pixels in the caller's memory, together with how much memory there is.
#include "oru/oru_ogl/ogl/pixelview.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"

#include <algorithm>
#include <limits>

namespace ORU::OGL {

namespace {

/// Bytes of a component, or of a whole pixel for the types that pack one into a number.
struct Size {
    std::uint64_t bytes;
    bool isPacked;
};

Size SizeOf(GLenum type) {
    switch (type) {
    case GL_UNSIGNED_BYTE:
    case GL_BYTE:
        return {1, false};
    case GL_UNSIGNED_SHORT:
    case GL_SHORT:
    case GL_HALF_FLOAT:
        return {2, false};
    case GL_UNSIGNED_INT:
    case GL_INT:
    case GL_FLOAT:
        return {4, false};
    case GL_UNSIGNED_BYTE_3_3_2:
    case GL_UNSIGNED_BYTE_2_3_3_REV:
        return {1, true};
    case GL_UNSIGNED_SHORT_5_6_5:
    case GL_UNSIGNED_SHORT_5_6_5_REV:
    case GL_UNSIGNED_SHORT_4_4_4_4:
    case GL_UNSIGNED_SHORT_4_4_4_4_REV:
    case GL_UNSIGNED_SHORT_5_5_5_1:
    case GL_UNSIGNED_SHORT_1_5_5_5_REV:
        return {2, true};
    case GL_UNSIGNED_INT_8_8_8_8:
    case GL_UNSIGNED_INT_8_8_8_8_REV:
    case GL_UNSIGNED_INT_10_10_10_2:
    case GL_UNSIGNED_INT_2_10_10_10_REV:
    case GL_UNSIGNED_INT_24_8:
    case GL_UNSIGNED_INT_10F_11F_11F_REV:
    case GL_UNSIGNED_INT_5_9_9_9_REV:
        return {4, true};
    case GL_FLOAT_32_UNSIGNED_INT_24_8_REV:
        return {8, true};
    default:
        ORU_THROW_INTERNAL("Pixels of ", ORUOGLTokenName(type),
                           " are no whole bytes: give the pointer itself");
    }
}

constexpr std::uint64_t kEndless = std::numeric_limits<std::uint64_t>::max();

} // namespace

std::uint64_t PixelShape::bytesPerPixel() const {
    Size const size = SizeOf(Texture::Type2GL(type));
    return size.isPacked ? size.bytes : size.bytes * Texture::Channels(format);
}

std::uint64_t PixelShape::rowBytes() const {
    internal::CheckByteAlignment(alignment);
    std::uint64_t const pixels = bytesPerPixel() * (rowLength ? rowLength : width);
    return (pixels + alignment - 1) / alignment * alignment;
}

std::uint64_t PixelShape::imageBytes() const {
    return rowBytes() * (imageHeight ? imageHeight : height);
}

std::uint64_t PixelShape::bytes() const {
    internal::CheckByteAlignment(alignment);
    std::uint64_t const last = bytesPerPixel() * width;
    if (width == 0 || height == 0 || depth == 0)
        return 0;
    constexpr std::uint64_t kLargest = std::numeric_limits<GLsizei>::max();
    if (std::max({width, height, depth, rowLength, imageHeight}) > kLargest)
        return kEndless;
    // With sides of 31 bits only the last product can be too much for 64 of them.
    std::uint64_t const row = rowBytes();
    std::uint64_t const rows = (depth - 1) * (imageHeight ? imageHeight : height) + height - 1;
    return rows <= (kEndless - last) / row ? rows * row + last : kEndless;
}

PixelUnpackParameters PixelShape::unpackParameters() const {
    PixelUnpackParameters parameters;
    parameters.setRowLength(static_cast<std::size_t>(rowLength));
    parameters.setImageHeight(static_cast<std::size_t>(imageHeight));
    parameters.setAlignment(alignment);
    return parameters;
}

PixelView::PixelView(void const *data, std::size_t bytes, PixelShape const &shape)
    : data_(data), bytes_(bytes), shape_(shape) {
    std::uint64_t const needed = shape.bytes();
    std::size_t const there = data ? bytes : 0;
    if (there < needed)
        ORU_THROW_INTERNAL("The memory is too short: ", shape.width, " x ", shape.height, " x ",
                           shape.depth, " pixels of ",
                           ORUOGLTokenName(Texture::Format2GL(shape.format)), " and ",
                           ORUOGLTokenName(Texture::Type2GL(shape.type)), " take ", needed,
                           " bytes, and it has ", there);
}

} // namespace ORU::OGL
