// Textures with two sides.
#pragma once

#include "oru/oru_ogl/ogl/texture.h"

namespace ORU::OGL {

class Buffer;
class MutablePixelView;
class PixelReadStream;
class PixelUploadStream;
class PixelView;
struct PixelShape;

/// A texture of rows of texels; the layers of a 1-D array count as rows. The transfers act on the
/// texture bound to the target.
class ORU_API Texture2 : public Texture {
public:
    Texture2(Texture2 &&other) noexcept = default;
    Texture2 &operator=(Texture2 &&other) noexcept = default;
    ~Texture2() override;

    /// The caller's memory that the texture was made over, or null.
    void *clientStorage() const {
        requireObject();
        return clientStorage_;
    }

    /// What lies beyond the edges: across by `s`, down by `t`.
    /// @throws InternalException when the texture is not bound
    /// @note glGetIntegerv, glTexParameteri
    void setWrap(WrapMode s, WrapMode t);

    /// Uploads a rectangle of texels from memory.
    /// @param level mip level, at least 0; the size is compared with level 0 whatever it is
    /// @param x, y first texel to write
    /// @param width, height texels, at least 1
    /// @param format, type of the pixels at `data`, which lie there as `params` tell
    /// @throws InternalException for a size or level out of range. Whether the rectangle lies
    ///         within the texture OpenGL says, by ExceptionOGL, which leaves the upload's unpack
    ///         state on the client attribute stack
    /// @note glPushClientAttrib, glPixelStorei, glTexSubImage2D, glPopClientAttrib
    void subImage(int level, int x, int y, std::uint64_t width, std::uint64_t height, Format format,
                  Type type, void const *data, PixelUnpackParameters const &params);

    /// Uploads a rectangle of texels from a buffer, which becomes a pixel unpack buffer. What was
    /// bound as such is bound again at the end.
    /// @param offset bytes from the buffer's beginning to the pixel data
    /// @throws InternalException also for an offset behind the buffer, and for a mapped buffer
    void subImage(int level, int x, int y, std::uint64_t width, std::uint64_t height, Format format,
                  Type type, Buffer *buffer, std::size_t offset,
                  PixelUnpackParameters const &params);

    /// Uploads pixels whose memory is long enough for them. Pixel storage is as it was afterwards,
    /// also after a failure.
    /// @throws InternalException for pixels of more sides than the texture's, also as above
    /// @note glTexSubImage2D, with glPixelStorei and what saves its state around it
    void subImage(int level, int x, int y, PixelView const &pixels);

    /// Uploads compressed blocks.
    /// @param level, x, y, width, height as `subImage`; x and y at multiples of a block's 4 texels
    /// @param data `bytes` bytes, or an offset into the pixel unpack buffer while one is bound
    /// @throws InternalException for a size or level out of range, for a format that is not
    ///         compressed, and for another number of bytes than the blocks take (see `SizeInBytes`)
    /// @note glCompressedTexSubImage2D, with glPixelStorei and what saves its state around it;
    /// needs OpenGL 1.3
    void compressedSubImage(int level, int x, int y, std::uint64_t width, std::uint64_t height,
                            void const *data, std::size_t bytes);

    /// Reads the compressed blocks of a level.
    /// @param dst, bytes memory, of `compressedSize(level)` bytes; an offset while a pixel pack
    ///        buffer is bound
    /// @throws InternalException when the texture is not bound, for a format that is
    ///         not compressed, and for another number of bytes
    /// @note glGetTexLevelParameteriv; glGetCompressedTexImage, with glPixelStorei and what saves
    ///       its state around it; needs OpenGL 1.3
    void getCompressedData(void *dst, std::size_t bytes, int level) const;

    /// Copies a rectangle of the current read framebuffer, beginning at (x, y).
    /// @throws InternalException for a size or level out of range, as `subImage`
    /// @note glCopyTexSubImage2D
    void copyTexSubImage(int level, int xOffset, int yOffset, int x, int y, std::uint64_t width,
                         std::uint64_t height);

    /// Reads a level into memory of `pixelDataSize` bytes (for level 0 and alignment 1).
    /// @param alignment bytes that rows are aligned to: 1, 2, 4 or 8
    /// @throws InternalException when the texture is not bound, for FORMAT_COLOR_INDEX and for
    ///         other alignments; ExceptionOGL for what OpenGL refuses, which leaves the download's
    ///         pack state on the client attribute stack
    /// @note glPushClientAttrib, glPixelStorei, glGetTexImage, glPopClientAttrib
    void getPixelData(void *dst, int level, Format format, Type type, unsigned int alignment) const;

    /// Reads a level into a buffer, which becomes a pixel pack buffer. What was bound as such is
    /// bound again at the end.
    /// @param offset bytes from the buffer's beginning
    /// @throws InternalException also for a mapped buffer
    void getPixelData(Buffer *buffer, std::size_t offset, int level, Format format, Type type,
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
    /// @param clientStorage pixels that the texture is made over and that outlive it, or null
    /// @param type of the components at `clientStorage`; TYPE_NONE means unsigned bytes
    /// @throws InternalException for a size that is no power of two where that is needed, and for
    ///         client storage without GL_APPLE_client_storage; ExceptionOGL when OpenGL refuses
    ///         size or format
    /// @note glTexImage2D
    Texture2(Target target, TargetBinding binding, InternalFormat format, std::uint64_t width,
             std::uint64_t height, bool mipmapped, void *clientStorage, Type type);

    /// A texture that was made elsewhere, see Texture.
    Texture2(Target target, TargetBinding binding, unsigned int name, ownership_tag ownership);

private:
    friend class PixelReadStream;
    friend class PixelUploadStream;

    /// Transfers without a word about memory.
    /// @param pixels an address, or an offset into the buffer that is bound for such transfers
    void upload(int level, int x, int y, PixelShape const &shape, void const *pixels);
    void readLevel(int level, PixelShape const &shape, void *pixels) const;

    void checkPart(char const *operation, int level, std::uint64_t width,
                   std::uint64_t height) const;
    void allocate(bool mipmapped, Type type);

    void *clientStorage_ = nullptr;
};

/// GL_TEXTURE_2D.
///
/// ```cpp
/// Texture2D texture(Texture::INTERNALFORMAT_RGBA8, width, height, false);
/// TextureUnit::Unit(0)->bind(&texture); // on the active unit
/// texture.setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
/// texture.subImage(0, 0, 0, width, height, Texture::FORMAT_RGBA,
///                  Texture::TYPE_UNSIGNED_BYTE, pixels, PixelUnpackParameters());
/// ```
class ORU_API Texture2D : public Texture2 {
public:
    /// Makes the texture and its storage.
    /// @param width, height texels of level 0
    /// @param mipmapped whether the levels down to one texel are allocated too
    /// @param clientStorage, type see Texture2
    Texture2D(InternalFormat format, std::uint64_t width, std::uint64_t height, bool mipmapped,
              void *clientStorage = nullptr, Type type = TYPE_NONE);

    /// A texture that was made elsewhere; sizes and format are what its level 0 has. After a
    /// failure the name is the caller's as before.
    /// @throws InternalException for a name that is no texture, one without level 0, and a format
    ///         that no InternalFormat stands for; ExceptionOGL for a texture of another target
    /// @note glIsTexture, glBindTexture, glGetTexLevelParameteriv
    Texture2D(unsigned int name, ownership_tag ownership);

    /// Always true.
    static bool IsSupported() { return true; }
};

/// GL_TEXTURE_RECTANGLE: sampled by texel coordinates, without mipmaps.
class ORU_API TextureRECT : public Texture2 {
public:
    /// Makes the texture and its storage.
    /// @param clientStorage, type see Texture2
    TextureRECT(InternalFormat format, std::uint64_t width, std::uint64_t height,
                void *clientStorage = nullptr, Type type = TYPE_NONE);

    /// See Texture2D.
    TextureRECT(unsigned int name, ownership_tag ownership);

    /// GL_ARB_texture_rectangle.
    static bool IsSupported();
};

/// GL_TEXTURE_1D_ARRAY: `height(0)` layers of one row each, as many on every mip level.
class ORU_API Texture1DArray : public Texture2 {
public:
    /// Makes the texture and its storage.
    /// @param width, layers texels of level 0, and how many rows
    /// @param mipmapped whether the levels down to one texel are allocated too
    /// @throws as Texture2, and ExceptionOGL where the context has no array textures
    Texture1DArray(InternalFormat format, std::uint64_t width, std::uint64_t layers,
                   bool mipmapped);

    /// See Texture2D.
    Texture1DArray(unsigned int name, ownership_tag ownership);

    /// Always 1.
    std::uint64_t depth(unsigned int level) const override;
};

} // namespace ORU::OGL
