// Frames on their way out of framebuffers and textures.
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

/// Reads frame after frame into buffers of OpenGL's own, and takes each when it is there: the host
/// draws the next frames meanwhile instead of waiting.
///
/// ```cpp
/// PixelReadStream stream({Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 1920, 1080});
/// for (;;) {
///     … draw …
///     if (stream.isFull() || stream.isReady()) {
///         PixelView const frame = stream.begin(); // the oldest
///         Encode(frame.data(), frame.bytes());
///         stream.end();
///     }
///     stream.read(0, 0);
/// }
/// ```
///
/// Nothing is allocated from frame to frame. A stream moves; one that was moved from can be
/// assigned to or destroyed only. OpenGL 3.2, or pixel buffers with GL_ARB_map_buffer_range and
/// GL_ARB_sync.
class ORU_API PixelReadStream {
public:
    /// Makes the buffers. What is bound stays.
    /// @param shape of each frame
    /// @param frames buffers, 2 at least
    /// @throws InternalException without `IsSupported()`, for fewer frames and for a shape without
    ///         pixels; ExceptionOGL when there is no memory
    /// @note glGenBuffers, glBufferData
    explicit PixelReadStream(PixelShape const &shape, unsigned int frames = 3);

    PixelReadStream(PixelReadStream &&other) noexcept;
    PixelReadStream &operator=(PixelReadStream &&other) noexcept;

    /// Deletes the buffers. @note glDeleteBuffers, glDeleteSync
    ~PixelReadStream();

    /// @name Ask for a frame
    /// It arrives some time later, after those that were asked for before. The pixel pack buffer
    /// that is bound, and pixel storage, stay.
    /// @throws InternalException when all buffers hold frames that were not taken, and for a shape
    ///         of more sides, or of other ones, than what is read; ExceptionOGL for what OpenGL
    ///         refuses. There is no frame then
    /// @{

    /// From the read framebuffer, the rectangle with its lower left corner at (x, y), in bands of
    /// about a mebibyte, the last first.
    /// @note glReadPixels, glFenceSync
    void read(int x, int y);

    /// A level of the texture that is bound to its target.
    /// @note glGetTexImage, glFenceSync
    void read(Texture1 const &texture, int level);
    void read(Texture2 const &texture, int level); ///< As above.
    void read(Texture3 const &texture, int level); ///< As above.
    /// @}

    std::size_t count() const { return count_; } ///< Frames that were asked for and not taken yet.

    /// Whether a frame has to be taken before another can be asked for.
    bool isFull() const;

    /// Whether there is a frame and `begin()` would not wait for it. @note glClientWaitSync
    bool isReady() const;

    /// The oldest frame, the host's until `end()`; waits for it. Called again before `end()`, it
    /// gives the same frame.
    /// @throws InternalException when none was asked for, and when it is not there after half a
    ///         minute
    /// @note glClientWaitSync, glMapBufferRange
    PixelView begin();

    /// Gives the frame back, whose memory is OpenGL's again.
    /// @throws InternalException before `begin()`, and when the system has lost the memory's
    ///         contents; the frame is the oldest then still
    /// @note glUnmapBuffer
    void end();

    /// Whether the current context can; false without a context.
    static bool IsSupported();

private:
    internal::PixelRing &ring() const;
    template<class Read>
    void ask(Read read);

    ScopedPtr<internal::PixelRing> ring_;
    std::size_t count_ = 0; ///< the first ones of the ring, the oldest at their head
};

} // namespace ORU::OGL
