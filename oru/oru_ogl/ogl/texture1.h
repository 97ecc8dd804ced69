// Textures with one side.
#pragma once

#include "oru/oru_ogl/ogl/texture.h"

namespace ORU::OGL {

class Buffer;
class MutablePixelView;
class PixelReadStream;
class PixelUploadStream;
class PixelView;
struct PixelShape;

/// A texture of one row of texels. The transfers act on the texture bound to the target.
class ORU_API Texture1 : public Texture {
public:
    Texture1(Texture1 &&other) noexcept = default;
    Texture1 &operator=(Texture1 &&other) noexcept = default;
    ~Texture1() override;

    /// What lies beyond the edges.
    /// @note glTexParameteri
    void setWrap(WrapMode s);

    /// Uploads texels from memory.
    /// @param level mip level, at least 0; the size is compared with level 0 whatever it is
    /// @param x first texel to write
    /// @param width texels, at least 1
    /// @param format, type of the pixels at `data`, which lie there as `params` tell
    /// @throws InternalException for a size or level out of range. Whether the range lies within
    ///         the texture OpenGL says, by ExceptionOGL, which leaves the upload's unpack state on
    ///         the client attribute stack
    /// @note glPushClientAttrib, glPixelStorei, glTexSubImage1D, glPopClientAttrib
    void subImage(int level, int x, std::uint64_t width, Format format, Type type, void const *data,
                  PixelUnpackParameters const &params);

    /// Uploads texels from a buffer, which becomes a pixel unpack buffer. What was bound as such
    /// is bound again at the end.
    /// @param offset bytes from the buffer's beginning to the pixel data
    /// @throws InternalException also for an offset behind the buffer, and for a mapped buffer
    void subImage(int level, int x, std::uint64_t width, Format format, Type type, Buffer *buffer,
                  std::size_t offset, PixelUnpackParameters const &params);

    /// Uploads pixels whose memory is long enough for them. Pixel storage is as it was afterwards,
    /// also after a failure.
    /// @throws InternalException for pixels of more sides than the texture's, also as above
    /// @note glTexSubImage1D, with glPixelStorei and what saves its state around it
    void subImage(int level, int x, PixelView const &pixels);

    /// Copies pixels of the current read framebuffer, beginning at (x, y).
    /// @throws InternalException for a size or level out of range, as `subImage`
    /// @note glCopyTexSubImage1D
    void copyTexSubImage(int level, int xOffset, int x, int y, std::uint64_t width);

    /// Reads a level, with the pixel-store state as it is.
    /// @param format, type GL enumeration values of the pixels at `dst`
    /// @note glGetTexImage
    void getPixelData(void *dst, int level, unsigned int format, unsigned int type) const;

    /// Reads a level into a buffer, which becomes a pixel pack buffer. The pack alignment is 1
    /// afterwards; the buffer binding is as it was.
    /// @param offset bytes from the buffer's beginning
    /// @throws InternalException for a mapped buffer
    /// @note glPixelStorei, glBindBuffer, glGetTexImage
    void getPixelData(Buffer *buffer, int offset, int level, unsigned int format,
                      unsigned int type) const;

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
    /// @throws InternalException for a size that is no power of two where that is needed,
    ///         ExceptionOGL when OpenGL refuses size or format
    /// @note glTexImage1D
    Texture1(Target target, TargetBinding binding, InternalFormat format, std::uint64_t width,
             bool mipmapped);

    /// A texture that was made elsewhere, see Texture.
    Texture1(Target target, TargetBinding binding, unsigned int name, ownership_tag ownership);

private:
    friend class PixelReadStream;
    friend class PixelUploadStream;

    /// Transfers without a word about memory.
    /// @param pixels an address, or an offset into the buffer that is bound for such transfers
    void upload(int level, int x, PixelShape const &shape, void const *pixels);
    void readLevel(int level, PixelShape const &shape, void *pixels) const;

    void checkPart(char const *operation, int level, std::uint64_t width) const;
};

/// GL_TEXTURE_1D.
class ORU_API Texture1D : public Texture1 {
public:
    /// Makes the texture and its storage.
    /// @param width texels of level 0
    /// @param mipmapped whether the levels down to one texel are allocated too
    Texture1D(InternalFormat format, std::uint64_t width, bool mipmapped);

    /// A texture that was made elsewhere; sizes and format are what its level 0 has. After a
    /// failure the name is the caller's as before.
    /// @throws InternalException for a name that is no texture, one without level 0, and a format
    ///         that no InternalFormat stands for; ExceptionOGL for a texture of another target
    /// @note glIsTexture, glBindTexture, glGetTexLevelParameteriv
    Texture1D(unsigned int name, ownership_tag ownership);
};

} // namespace ORU::OGL
