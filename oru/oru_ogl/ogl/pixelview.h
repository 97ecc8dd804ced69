// Pixels in the caller's memory, together with how much memory there is.
#pragma once

#include "oru/oru_ogl/ogl/texture.h"

#include <cstddef>
#include <cstdint>

namespace ORU::OGL {

/// What pixels in memory are and how they lie there.
///
/// ```cpp
/// PixelShape frame = {Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 1920, 1080};
/// frame.rowLength = 2048; // rows with a gap
/// ```
struct ORU_API PixelShape {
    Texture::Format format = Texture::FORMAT_RGBA;    ///< the components of a pixel
    Texture::Type type = Texture::TYPE_UNSIGNED_BYTE; ///< the type of a component
    std::uint64_t width = 1;                          ///< pixels of a row
    std::uint64_t height = 1;                         ///< rows of an image, or layers of rows
    std::uint64_t depth = 1;                          ///< images, or layers of images
    std::uint64_t rowLength = 0;   ///< pixels from one row to the next; 0 means `width`
    std::uint64_t imageHeight = 0; ///< rows from one image to the next; 0 means `height`
    unsigned int alignment = 1;    ///< rows begin at multiples of 1, 2, 4 or 8 bytes

    /// Bytes of one pixel.
    /// @throws InternalException for TYPE_BITMAP, whose pixels are smaller than a byte, and for
    ///         numbers that are no format or type
    std::uint64_t bytesPerPixel() const;

    /// Bytes from the beginning of a row to that of the next.
    /// @throws InternalException as `bytes`
    std::uint64_t rowBytes() const;

    /// Bytes from the beginning of an image to that of the next.
    /// @throws InternalException as `bytes`
    std::uint64_t imageBytes() const;

    /// Bytes from the beginning of the first pixel to the end of the last one, by section 8.4.4.1
    /// of the OpenGL 4.5 core specification; 0 when a side is 0, and the largest number for what
    /// OpenGL cannot address.
    /// @throws InternalException also for an alignment other than 1, 2, 4 or 8
    std::uint64_t bytes() const;

    /// The same for `subImage` from a buffer.
    PixelUnpackParameters unpackParameters() const;
};

/// Pixels to be read: a pointer that cannot be used beyond its memory.
///
/// ```cpp
/// std::vector<unsigned char> const pixels = Load();
/// texture.subImage(0, 0, 0,
///                  PixelView(pixels.data(), pixels.size(),
///                            {Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 640, 480}));
/// ```
///
/// It does not own the memory. Let no pixel buffer be bound while a texture takes one: OpenGL would
/// take the pointer for an offset into the buffer.
class ORU_API PixelView {
public:
    /// @param data the first pixel
    /// @param bytes what the memory has from there on
    /// @throws InternalException for memory, or no memory, that is too short for the shape; also as
    ///         PixelShape::bytes
    PixelView(void const *data, std::size_t bytes, PixelShape const &shape);

    void const *data() const { return data_; }         ///< The first pixel.
    std::size_t bytes() const { return bytes_; }       ///< As given to the constructor.
    PixelShape const &shape() const { return shape_; } ///< What lies there.

private:
    void const *data_;
    std::size_t bytes_;
    PixelShape shape_;
};

/// Pixels to be written, as PixelView.
///
/// ```cpp
/// std::vector<float> level(16 * 16);
/// texture.getPixelData(MutablePixelView(level.data(), level.size() * sizeof(float),
///                                       {Texture::FORMAT_RED, Texture::TYPE_FLOAT, 16, 16}), 0);
/// ```
class ORU_API MutablePixelView : public PixelView {
public:
    /// As PixelView's constructor.
    MutablePixelView(void *data, std::size_t bytes, PixelShape const &shape)
        : PixelView(data, bytes, shape), mutableData_(data) {}

    void *data() const { return mutableData_; } ///< The first pixel.

private:
    void *mutableData_;
};

} // namespace ORU::OGL
