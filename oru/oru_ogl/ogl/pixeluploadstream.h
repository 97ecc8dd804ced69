// Frames on their way into textures.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ogl/ogl/pixelview.h"

namespace ORU::OGL {

class Texture1;
class Texture2;
class Texture3;

namespace internal {
class PixelRing;
}

/// Uploads frame after frame from buffers of OpenGL's own, so that nobody waits for the other:
/// while OpenGL still reads one frame, the host writes the next one where OpenGL will read it.
///
/// ```cpp
/// PixelUploadStream stream({Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 1920, 1080});
/// for (;;) {
///     MutablePixelView const frame = stream.begin();
///     Decode(frame.data(), frame.bytes()); // writes every byte and reads none
///     stream.upload(texture, 0, 0, 0);
///     … draw …
/// }
/// ```
///
/// Nothing is allocated from frame to frame. A stream moves; one that was moved from can be
/// assigned to or destroyed only. OpenGL 3.2, or pixel buffers with GL_ARB_map_buffer_range and
/// GL_ARB_sync.
class ORU_API PixelUploadStream {
public:
    /// Makes the buffers. What is bound stays.
    /// @param shape of each frame
    /// @param frames buffers, 2 at least; with 3 the host is seldom held up
    /// @throws InternalException without `IsSupported()`, for fewer frames and for a shape without
    ///         pixels; ExceptionOGL when there is no memory
    /// @note glGenBuffers, glBufferData
    explicit PixelUploadStream(PixelShape const &shape, unsigned int frames = 3);

    PixelUploadStream(PixelUploadStream &&other) noexcept;
    PixelUploadStream &operator=(PixelUploadStream &&other) noexcept;

    /// Deletes the buffers. @note glDeleteBuffers, glDeleteSync
    ~PixelUploadStream();

    /// Whether `begin()` would not wait. @note glGetSynciv, glClientWaitSync
    bool isFree() const;

    /// Memory for the next frame, the host's until `upload`. Waits while OpenGL uses all buffers.
    /// Called again before `upload`, it gives the same frame.
    /// @return what the buffer holds from earlier or not, to be written only
    /// @throws InternalException when OpenGL is not done with the oldest frame after half a minute
    /// @note glGetSynciv, glClientWaitSync, glMapBufferRange
    MutablePixelView begin();

    /// @name Send the frame on its way
    /// To a part of the texture that is bound to its target, as its `subImage` does, in bands of
    /// about a mebibyte, the last first. The pixel unpack buffer that is bound, and pixel storage,
    /// stay. After a failure the frame is gone.
    /// @throws InternalException before `begin()`, and when the system has lost the memory's
    ///         contents; also as `subImage`
    /// @note glUnmapBuffer, glTexSubImage1D, glTexSubImage2D or glTexSubImage3D, glFenceSync
    /// @{
    void upload(Texture1 &texture, int level, int x);
    void upload(Texture2 &texture, int level, int x, int y);
    void upload(Texture3 &texture, int level, int x, int y, int z);
    /// @}

    /// Whether the current context can; false without a context.
    static bool IsSupported();

private:
    internal::PixelRing &ring() const;
    std::size_t firstFree() const;
    template<class AnyTexture, class... Place>
    void send(AnyTexture &texture, int level, Place... place);

    ScopedPtr<internal::PixelRing> ring_;
};

} // namespace ORU::OGL
