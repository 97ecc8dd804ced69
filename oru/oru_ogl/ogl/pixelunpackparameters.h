// How the pixels of an upload lie in the caller's memory.
#pragma once

#include "oru/core/utility/export.h"

#include <cstddef>

namespace ORU::OGL {

/// The client pixel layout of an upload, in terms of glPixelStore. By default rows follow each
/// other without gaps, which differs from OpenGL's own default of rows aligned to 4 bytes.
class ORU_API PixelUnpackParameters {
public:
    /// Rows begin at multiples of 1, 2, 4 or 8 bytes.
    enum Alignment : unsigned int {
        ALIGNMENT_1 = 0, ///< anywhere
        ALIGNMENT_2,     ///< every 2 bytes
        ALIGNMENT_4,     ///< every 4 bytes
        ALIGNMENT_8      ///< every 8 bytes
    };

    /// Whether the bytes of each component are in the other byte order than the machine's.
    bool swapBytes() const { return swapBytes_; }
    void enableSwapBytes() { swapBytes_ = true; }   ///< GL_UNPACK_SWAP_BYTES
    void disableSwapBytes() { swapBytes_ = false; } ///< the default

    /// Whether the bits of bitmaps begin with each byte's lowest one.
    bool isFirstLSB() const { return firstLSB_; }
    void makeFirstLSB() { firstLSB_ = true; }  ///< GL_UNPACK_LSB_FIRST
    void makeFirstMSB() { firstLSB_ = false; } ///< the default

    /// Pixels in a row of memory; 0 means the width of the upload.
    std::size_t rowLength() const { return rowLength_; }
    void setRowLength(std::size_t pixels) { rowLength_ = pixels; } ///< GL_UNPACK_ROW_LENGTH

    /// Rows in an image of memory, for 3-D uploads; 0 means the height of the upload.
    std::size_t imageHeight() const { return imageHeight_; }
    void setImageHeight(std::size_t rows) { imageHeight_ = rows; } ///< GL_UNPACK_IMAGE_HEIGHT

    /// @name What lies in memory before the first pixel to upload
    /// In pixels, rows and (for 3-D uploads) images.
    /// @{
    std::size_t skipPixels() const { return skipPixels_; }
    void setSkipPixels(std::size_t pixels) { skipPixels_ = pixels; }
    std::size_t skipRows() const { return skipRows_; }
    void setSkipRows(std::size_t rows) { skipRows_ = rows; }
    std::size_t skipImages() const { return skipImages_; }
    void setSkipImages(std::size_t images) { skipImages_ = images; }
    /// @}

    Alignment alignment() const { return alignment_; }                 ///< ALIGNMENT_1 unless set
    void setAlignment(Alignment alignment) { alignment_ = alignment; } ///< GL_UNPACK_ALIGNMENT

    /// Sets the alignment by its bytes.
    /// @param bytes 1, 2, 4 or 8
    /// @throws InternalException for any other number
    void setAlignment(unsigned int bytes);

    /// Makes this the current context's unpack state. Image height and skipped images are set only
    /// where 3-D textures exist (OpenGL 1.2 or GL_EXT_texture3D).
    /// @throws InternalException for an alignment that is no enumerator, ExceptionOGL for a size
    ///         that is negative as a 32-bit integer
    /// @note glPixelStorei
    void apply() const;

private:
    bool swapBytes_ = false;
    bool firstLSB_ = false;
    std::size_t rowLength_ = 0;
    std::size_t imageHeight_ = 0;
    std::size_t skipPixels_ = 0;
    std::size_t skipRows_ = 0;
    std::size_t skipImages_ = 0;
    Alignment alignment_ = ALIGNMENT_1;
};

} // namespace ORU::OGL
