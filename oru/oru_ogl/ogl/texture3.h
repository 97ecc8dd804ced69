// Textures with three sides.
#pragma once

#include "oru/oru_ogl/ogl/texture.h"

namespace ORU::OGL {

class Buffer;
class MutablePixelView;
class PixelReadStream;
class PixelUploadStream;
class PixelView;
struct PixelShape;

/// A texture of images of texels; the layers of a 2-D array count as images. The transfers act on
/// the texture bound to the target.
class ORU_API Texture3 : public Texture {
public:
    Texture3(Texture3 &&other) noexcept = default;
    Texture3 &operator=(Texture3 &&other) noexcept = default;
    ~Texture3() override;

    /// What lies beyond the edges: across by `s`, down by `t`, deep by `r`.
    /// @note glTexParameteri
    void setWrap(WrapMode s, WrapMode t, WrapMode r);

    /// Uploads a box of texels from memory.
    /// @param level mip level, at least 0; the size is compared with level 0 whatever it is
    /// @param x, y, z first texel to write
    /// @param width, height, depth texels, at least 1
    /// @param format, type of the pixels at `data`, which lie there as `params` tell
    /// @throws InternalException for a size or level out of range. Whether the box lies within the
    ///         texture OpenGL says, by ExceptionOGL, which leaves the upload's unpack state on the
    ///         client attribute stack
    /// @note glPushClientAttrib, glPixelStorei, glTexSubImage3D, glPopClientAttrib
    void subImage(int level, int x, int y, int z, std::uint64_t width, std::uint64_t height,
                  std::uint64_t depth, Format format, Type type, void const *data,
                  PixelUnpackParameters const &params);

    /// Uploads a box of texels from a buffer, which becomes a pixel unpack buffer. What was bound
    /// as such is bound again at the end.
    /// @param offset bytes from the buffer's beginning to the pixel data
    /// @throws InternalException also for an offset behind the buffer, and for a mapped buffer
    void subImage(int level, int x, int y, int z, std::uint64_t width, std::uint64_t height,
                  std::uint64_t depth, Format format, Type type, Buffer *buffer, std::size_t offset,
                  PixelUnpackParameters const &params);

    /// Uploads pixels whose memory is long enough for them. Pixel storage is as it was afterwards,
    /// also after a failure.
    /// @throws InternalException for pixels of more sides than the texture's, also as above
    /// @note glTexSubImage3D, with glPixelStorei and what saves its state around it
    void subImage(int level, int x, int y, int z, PixelView const &pixels);

    /// Uploads compressed blocks.
    /// @param level, x, y, z, width, height, depth as `subImage`; x and y at multiples of a block's
    /// 4 texels
    /// @param data `bytes` bytes, or an offset into the pixel unpack buffer while one is bound
    /// @throws InternalException for a size or level out of range, for a format that is not
    ///         compressed, and for another number of bytes than the blocks take (see `SizeInBytes`)
    /// @note glCompressedTexSubImage3D; needs OpenGL 1.3
    void compressedSubImage(int level, int x, int y, int z, std::uint64_t width,
                            std::uint64_t height, std::uint64_t depth, void const *data,
                            std::size_t bytes);

    /// Reads the compressed blocks of a level.
    /// @param dst, bytes memory, of `compressedSize(level)` bytes; an offset while a pixel pack
    ///        buffer is bound
    /// @throws InternalException when the texture is not bound, for a format that is
    ///         not compressed, and for another number of bytes
    /// @note glGetTexLevelParameteriv; glGetCompressedTexImage, with glPixelStorei and what saves
    ///       its state around it; needs OpenGL 1.3
    void getCompressedData(void *dst, std::size_t bytes, int level) const;

    /// Copies a rectangle of the current read framebuffer, beginning at (x, y), into one image.
    /// @throws InternalException for a size or level out of range, as `subImage`
    /// @note glCopyTexSubImage3D
    void copyTexSubImage(int level, int xOffset, int yOffset, int zOffset, int x, int y,
                         std::uint64_t width, std::uint64_t height);

    /// Reads a level into memory of `pixelDataSize` bytes (for level 0 and alignment 1).
    /// @param alignment bytes that rows are aligned to: 1, 2, 4 or 8
    /// @throws InternalException for FORMAT_COLOR_INDEX and for other alignments; ExceptionOGL for
    ///         what OpenGL refuses, which leaves the download's pack state on the client attribute
    ///         stack
    /// @note glPushClientAttrib, glPixelStorei, glGetTexImage, glPopClientAttrib
    void getPixelData(void *dst, int level, Format format, Type type, unsigned int alignment) const;

    /// Reads a level into a buffer, which becomes a pixel pack buffer. What was bound as such is
    /// bound again at the end.
    /// @param offset bytes from the buffer's beginning
    /// @throws InternalException for a mapped buffer and for other alignments
    void getPixelData(Buffer *buffer, int offset, int level, Format format, Type type,
                      unsigned int alignment) const;

    /// Reads a level into memory that is long enough for it. Pixel storage is as it was afterwards,
    /// also after a failure.
    /// @param pixels as many as the level has texels
    /// @throws InternalException when the texture is not bound, and for pixels of other sides than
    ///         the level's
    /// @note glGetTexLevelParameteriv; glGetTexImage, with glPixelStorei and what saves its state
    ///       around it
    void getPixelData(MutablePixelView const &pixels, int level) const;

    /// Bytes that level 0 takes in memory when its rows have no gaps, whatever the level.
    /// @throws InternalException for types other than bytes, shorts, half floats and floats
    std::size_t pixelDataSize(int level, Format format, Type type) const;

protected:
    /// Makes the texture and its storage.
    /// @throws InternalException for a size that is no power of two where that is needed, and
    ///         before OpenGL 1.2; ExceptionOGL when OpenGL refuses size or format
    /// @note glTexImage3D
    Texture3(Target target, TargetBinding binding, InternalFormat format, std::uint64_t width,
             std::uint64_t height, std::uint64_t depth, bool mipmapped);

    /// Makes one level with its contents; failures as above.
    /// @param clientFormat, type of the pixels at `data`, which lie there as `params` tell
    Texture3(Target target, TargetBinding binding, InternalFormat format, int level,
             std::uint64_t width, std::uint64_t height, std::uint64_t depth, Format clientFormat,
             Type type, void const *data, PixelUnpackParameters const &params);

    /// A texture that was made elsewhere, see Texture.
    Texture3(Target target, TargetBinding binding, unsigned int name, ownership_tag ownership);

private:
    friend class PixelReadStream;
    friend class PixelUploadStream;

    /// Transfers without a word about memory.
    /// @param pixels an address, or an offset into the buffer that is bound for such transfers
    void upload(int level, int x, int y, int z, PixelShape const &shape, void const *pixels);
    void readLevel(int level, PixelShape const &shape, void *pixels) const;

    void checkPart(int level, std::uint64_t width, std::uint64_t height, std::uint64_t depth) const;
    template<class Allocate>
    void initialize(Allocate allocate);
};

/// GL_TEXTURE_3D.
class ORU_API Texture3D : public Texture3 {
public:
    /// Makes the texture and its storage.
    /// @param width, height, depth texels of level 0
    /// @param mipmapped whether the levels down to one texel are allocated too
    Texture3D(InternalFormat format, std::uint64_t width, std::uint64_t height, std::uint64_t depth,
              bool mipmapped);

    /// See Texture3.
    Texture3D(InternalFormat format, int level, std::uint64_t width, std::uint64_t height,
              std::uint64_t depth, Format clientFormat, Type type, void const *data,
              PixelUnpackParameters const &params);

    /// As Texture2D's.
    Texture3D(unsigned int name, ownership_tag ownership);

    /// Always true.
    static bool IsSupported() { return true; }
};

/// GL_TEXTURE_2D_ARRAY: `depth(level)` layers on every mip level.
class ORU_API Texture2DArray : public Texture3 {
public:
    /// Makes the texture and its storage.
    /// @param width, height, layers texels of level 0, and how many images
    /// @param mipmapped whether the levels down to one texel are allocated too
    /// @throws as Texture3, and ExceptionOGL where the context has no array textures
    Texture2DArray(InternalFormat format, std::uint64_t width, std::uint64_t height,
                   std::uint64_t layers, bool mipmapped);

    /// As Texture2D's.
    Texture2DArray(unsigned int name, ownership_tag ownership);

    /// The number of layers.
    std::uint64_t depth(unsigned int level) const override;
};

/// GL_TEXTURE_CUBE_MAP_ARRAY: cubes of six square images each, sampled by a direction and a number.
/// The images are addressed like layers, six a cube in the order of TextureCube::Face:
///
/// ```cpp
/// rooms.subImage(0, 0, 0, 6 * room + TextureCube::FACE_POSITIVE_Y, side, side, 1, …);
/// ```
class ORU_API TextureCubeArray : public Texture3 {
public:
    /// Makes the texture and its storage.
    /// @param side, cubes texels of a side of level 0, and how many cubes
    /// @param mipmapped whether the levels down to one texel are allocated too
    /// @throws as Texture3, and InternalException without GL_ARB_texture_cube_map_array
    TextureCubeArray(InternalFormat format, std::uint64_t side, std::uint64_t cubes,
                     bool mipmapped);

    /// As Texture2D's.
    TextureCubeArray(unsigned int name, ownership_tag ownership);

    /// The number of images, six times that of cubes.
    std::uint64_t depth(unsigned int level) const override;

    /// OpenGL 4.0 or GL_ARB_texture_cube_map_array.
    static bool IsSupported();
};

} // namespace ORU::OGL
