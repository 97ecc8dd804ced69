// Cube maps: six square images around a point.
#pragma once

#include "oru/oru_ogl/ogl/texture.h"

namespace ORU::OGL {

class Buffer;
class MutablePixelView;
class PixelView;

/// GL_TEXTURE_CUBE_MAP: six square images, sampled by a direction. The transfers act on the texture
/// bound to the target.
///
/// ```cpp
/// TextureCube sky(Texture::INTERNALFORMAT_SRGB8_ALPHA8, 256, true);
/// TextureUnit::Unit(0)->bind(&sky);
/// for (TextureCube::Face face : kCubeFaces)
///     sky.subImage(face, 0, 0, 0, pixels[face]);
/// sky.generateMipmap();
/// ```
class ORU_API TextureCube : public Texture {
public:
    /// An image, by the axis that it stands across. Rows run as OpenGL's core specification 4.5
    /// draws them in table 8.19: on the faces of x and z from the top down.
    enum Face : unsigned int {
        FACE_POSITIVE_X = 0, ///< GL_TEXTURE_CUBE_MAP_POSITIVE_X
        FACE_NEGATIVE_X,     ///< GL_TEXTURE_CUBE_MAP_NEGATIVE_X
        FACE_POSITIVE_Y,     ///< GL_TEXTURE_CUBE_MAP_POSITIVE_Y
        FACE_NEGATIVE_Y,     ///< GL_TEXTURE_CUBE_MAP_NEGATIVE_Y
        FACE_POSITIVE_Z,     ///< GL_TEXTURE_CUBE_MAP_POSITIVE_Z
        FACE_NEGATIVE_Z      ///< GL_TEXTURE_CUBE_MAP_NEGATIVE_Z
    };

    /// Makes the texture and its storage.
    /// @param side texels of a side of level 0
    /// @param mipmapped whether the levels down to one texel are allocated too
    /// @throws InternalException before OpenGL 1.3; ExceptionOGL when OpenGL refuses size or format
    /// @note glTexImage2D
    TextureCube(InternalFormat format, std::uint64_t side, bool mipmapped);

    /// A texture that was made elsewhere; side and format are what level 0 of the first face has.
    /// Failures as Texture2D's.
    TextureCube(unsigned int name, ownership_tag ownership);

    TextureCube(TextureCube &&other) noexcept = default;
    TextureCube &operator=(TextureCube &&other) noexcept = default;
    ~TextureCube() override;

    /// The number of faces.
    std::uint64_t depth(unsigned int level) const override;

    /// What lies beyond the edges of the faces; a direction never leads there where the context
    /// filters across edges (GL_TEXTURE_CUBE_MAP_SEAMLESS).
    /// @note glTexParameteri
    void setWrap(WrapMode s, WrapMode t, WrapMode r);

    /// Uploads a rectangle of a face from memory; parameters and failures as Texture2::subImage,
    /// and InternalException for a number that is no Face.
    /// @note glPixelStorei, glTexSubImage2D
    void subImage(Face face, int level, int x, int y, std::uint64_t width, std::uint64_t height,
                  Format format, Type type, void const *data, PixelUnpackParameters const &params);

    /// Uploads a rectangle of a face from a buffer, which becomes a pixel unpack buffer. What was
    /// bound as such is bound again at the end.
    /// @param offset bytes from the buffer's beginning to the pixel data
    void subImage(Face face, int level, int x, int y, std::uint64_t width, std::uint64_t height,
                  Format format, Type type, Buffer *buffer, std::size_t offset,
                  PixelUnpackParameters const &params);

    /// Uploads pixels whose memory is long enough for them. Pixel storage is as it was afterwards,
    /// also after a failure.
    /// @throws InternalException for pixels of more than two sides, also as above
    /// @note glTexSubImage2D, with glPixelStorei and what saves its state around it
    void subImage(Face face, int level, int x, int y, PixelView const &pixels);

    /// Uploads compressed blocks of a face, as Texture2::compressedSubImage.
    /// @note glCompressedTexSubImage2D
    void compressedSubImage(Face face, int level, int x, int y, std::uint64_t width,
                            std::uint64_t height, void const *data, std::size_t bytes);

    /// Copies a rectangle of the current read framebuffer, beginning at (x, y), into a face.
    /// @note glCopyTexSubImage2D
    void copyTexSubImage(Face face, int level, int xOffset, int yOffset, int x, int y,
                         std::uint64_t width, std::uint64_t height);

    /// Reads a level of a face into memory of `pixelDataSize` bytes (for level 0 and alignment 1).
    /// Parameters and failures as Texture2::getPixelData.
    /// @note glPixelStorei, glGetTexImage
    void getPixelData(Face face, void *dst, int level, Format format, Type type,
                      unsigned int alignment) const;

    /// Reads a level of a face into a buffer, which becomes a pixel pack buffer. What was bound as
    /// such is bound again at the end.
    /// @param offset bytes from the buffer's beginning
    void getPixelData(Face face, Buffer *buffer, std::size_t offset, int level, Format format,
                      Type type, unsigned int alignment) const;

    /// Reads a level of a face into memory that is long enough for it. Pixel storage is as it was
    /// afterwards, also after a failure.
    /// @throws InternalException when the texture is not bound, and for pixels of other sides than
    ///         the level's
    /// @note glGetTexLevelParameteriv; glGetTexImage, with glPixelStorei and what saves its state
    ///       around it
    void getPixelData(Face face, MutablePixelView const &pixels, int level) const;

    /// Reads the compressed blocks of a level of a face.
    /// @param dst, bytes memory, of a sixth of `compressedSize(level)` bytes
    /// @note glGetTexLevelParameteriv; glGetCompressedTexImage, with glPixelStorei and what saves
    ///       its state around it
    void getCompressedData(Face face, void *dst, std::size_t bytes, int level) const;

    /// Bytes that level 0 of a face takes in memory when its rows have no gaps.
    /// @throws InternalException for types without a size, see Texture2::pixelDataSize
    std::size_t pixelDataSize(Format format, Type type) const;

    /// The GL enumeration value of a face, which calls for one image take in place of the target.
    /// @throws InternalException for a number that is no Face
    static unsigned int Face2GL(Face face);

    /// OpenGL 1.3.
    static bool IsSupported();

private:
    void checkPart(char const *operation, int level, std::uint64_t width,
                   std::uint64_t height) const;
    void requireBound() const;
};

/// The faces of a cube map, in order.
inline constexpr TextureCube::Face kCubeFaces[] = {
    TextureCube::FACE_POSITIVE_X, TextureCube::FACE_NEGATIVE_X, TextureCube::FACE_POSITIVE_Y,
    TextureCube::FACE_NEGATIVE_Y, TextureCube::FACE_POSITIVE_Z, TextureCube::FACE_NEGATIVE_Z};

} // namespace ORU::OGL
