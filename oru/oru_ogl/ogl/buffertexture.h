// Buffer textures: a buffer that shaders read as a long row of texels.
#pragma once

#include "oru/oru_ogl/ogl/texture.h"

namespace ORU::OGL {

class Buffer;

/// GL_TEXTURE_BUFFER: the store of a Buffer, read by `texelFetch` of a samplerBuffer. It has no
/// levels, filters or wrapping, and no transfers: write to the buffer.
class ORU_API BufferTexture : public Texture {
public:
    /// Makes a texture over all of a buffer, which outlives it. What was bound to the target stays
    /// bound. A store that grows or shrinks later is read at its new size, which `width(0)` does
    /// not tell.
    /// @param format one of 8, 16 or 32 bits a channel with a size in its name, INTERNALFORMAT_R8
    ///        and not INTERNALFORMAT_RED
    /// @throws InternalException without OpenGL 3.1 or GL_ARB_texture_buffer_object, and for a
    ///         format whose texels have no size; ExceptionOGL for one that buffer textures do not
    ///         have
    /// @note glTexBuffer, glTexBufferARB
    BufferTexture(InternalFormat format, Buffer const &buffer);

    /// A texture that was made elsewhere, and has a buffer; one of INTERNALFORMAT_R8 says
    /// INTERNALFORMAT_RED. Failures as Texture2D's.
    BufferTexture(unsigned int name, ownership_tag ownership);

    BufferTexture(BufferTexture &&other) noexcept = default;
    BufferTexture &operator=(BufferTexture &&other) noexcept = default;
    ~BufferTexture() override;

    /// The most texels that shaders can read of one.
    /// @throws InternalException where there are none
    /// @note glGetIntegerv
    static std::uint64_t MaxTexels();

    /// OpenGL 3.1 or GL_ARB_texture_buffer_object.
    static bool IsSupported();
};

} // namespace ORU::OGL
