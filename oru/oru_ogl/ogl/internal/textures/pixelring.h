// The buffers of a pixel stream, which OpenGL and the host use in turns.
#pragma once

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/pixelview.h"
#include "oru/oru_ogl/platformgl.h"

#include <vector>

namespace ORU::OGL::internal {

/// A mark behind what OpenGL does with a frame.
class FrameFence {
public:
    FrameFence() = default;
    FrameFence(FrameFence &&other) noexcept;
    FrameFence &operator=(FrameFence &&) = delete;
    ~FrameFence() { drop(); }

    bool isSet() const { return sync_ != nullptr; }

    /// Marks what was asked of OpenGL so far. @note glFenceSync
    void set();

    /// Whether all before the mark is done, or there is none; waits for no more than some
    /// nanoseconds. What was asked is sent on its way first. @note glClientWaitSync
    bool isDone(GLuint64 nanoseconds) const;

    /// Waits until then, and drops the mark.
    /// @throws InternalException after half a minute
    void wait();

private:
    void drop() noexcept;

    GLsync sync_ = nullptr;
};

/// One of the buffers.
struct Frame {
    Buffer buffer;
    FrameFence fence;
    void *memory = nullptr; ///< while it is mapped
};

/// Buffers for images of one shape. All of them are made at the beginning: nothing is allocated
/// while they are used.
class PixelRing {
public:
    /// @throws InternalException where streams are not supported, for a shape without pixels, and
    ///         for fewer than 2 frames
    PixelRing(PixelShape const &shape, unsigned int frames, Buffer::Type type, Buffer::Usage usage);

    PixelShape const &shape() const { return shape_; }
    std::size_t size() const { return frames_.size(); }
    Frame &operator[](std::size_t index) { return frames_[index % frames_.size()]; }

    /// The memory of a frame with which OpenGL is done; mapped already or mapped now.
    /// @param access as glMapBufferRange takes it
    MutablePixelView map(Frame &frame, GLbitfield access);

    /// Gives the memory back.
    /// @throws InternalException when the system has lost what was in it
    void unmap(Frame &frame);

    /// OpenGL 3.2, or pixel buffers with GL_ARB_map_buffer_range and GL_ARB_sync.
    static bool IsSupported();

private:
    PixelShape shape_;
    std::vector<Frame> frames_;
};

} // namespace ORU::OGL::internal
