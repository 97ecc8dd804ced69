// The buffers of a pixel stream, which OpenGL and the host use in turns.
#pragma once

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/fence.h"
#include "oru/oru_ogl/ogl/pixelview.h"
#include "oru/oru_ogl/platformgl.h"

#include <chrono>
#include <optional>
#include <vector>

namespace ORU::OGL::internal {

/// One of the buffers.
struct Frame {
    Buffer buffer;
    std::optional<Fence> fence; ///< behind what OpenGL does with the buffer
    void *memory = nullptr;     ///< while it is mapped

    /// Whether OpenGL is done with the buffer; what it was asked for is sent on its way first.
    bool isFree() const { return !fence || fence->clientWait(std::chrono::nanoseconds(0)); }
};

/// Buffers for images of one shape, those that were used last first among the free ones: where
/// OpenGL is done with a frame at once, the same memory goes round, which the caches still have.
/// All buffers are made at the beginning: nothing is allocated while they are used.
class PixelRing {
public:
    /// @throws InternalException where streams are not supported, for a shape without pixels, and
    ///         for fewer than 2 frames
    PixelRing(PixelShape const &shape, unsigned int frames, Buffer::Type type, Buffer::Usage usage);

    PixelShape const &shape() const { return shape_; }
    std::size_t size() const { return frames_.size(); }
    Frame &operator[](std::size_t index) { return frames_[index]; }

    /// Takes a frame out of its place and puts it in before or behind another.
    void move(std::size_t from, std::size_t to);

    /// Waits until OpenGL is done with a frame.
    /// @throws InternalException after half a minute
    static void Wait(Frame &frame);

    /// The memory of a frame with which OpenGL is done; mapped already or mapped now.
    /// @param access as glMapBufferRange takes it
    MutablePixelView map(Frame &frame, GLbitfield access);

    /// Gives the memory of a frame back whose buffer is bound.
    /// @throws InternalException when the system has lost what was in it
    static void Unmap(Frame &frame);

    /// OpenGL 3.2, or pixel buffers with GL_ARB_map_buffer_range and GL_ARB_sync.
    static bool IsSupported();

private:
    PixelShape shape_;
    std::vector<Frame> frames_;
};

} // namespace ORU::OGL::internal
