// The buffers of a pixel stream, which OpenGL and the host use in turns.
#include "oru/oru_ogl/ogl/internal/textures/pixelring.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"

#include <algorithm>

namespace ORU::OGL::internal {

namespace {

constexpr std::chrono::seconds kHalfAMinute(30);

} // namespace

PixelRing::PixelRing(PixelShape const &shape, unsigned int frames, Buffer::Type type,
                     Buffer::Usage usage)
    : shape_(shape) {
    ORU_ASSERT_TEXT("Pixel streams need OpenGL 3.2, or pixel buffers with GL_ARB_map_buffer_range "
                    "and GL_ARB_sync: ask IsSupported first, and transfer without a stream",
                    IsSupported());
    ORU_ASSERT_TEXT("A pixel stream needs two frames at least: one for OpenGL, one for the host",
                    frames >= 2);
    auto const bytes = static_cast<std::int64_t>(shape.bytes());
    frames_.reserve(frames);
    for (unsigned int i = 0; i < frames; ++i)
        frames_.push_back(Frame{Buffer(bytes, type, usage, nullptr), {}, nullptr});
}

void PixelRing::move(std::size_t from, std::size_t to) {
    auto const at = [this](std::size_t place) {
        return frames_.begin() + static_cast<std::ptrdiff_t>(place);
    };
    if (from < to)
        std::rotate(at(from), at(from + 1), at(to + 1));
    else
        std::rotate(at(to), at(from), at(from + 1));
}

void PixelRing::Wait(Frame &frame) {
    ORU_ASSERT_TEXT("OpenGL is not done with a frame of a stream after half a minute: the device "
                    "hangs, or the context is lost",
                    !frame.fence || frame.fence->clientWait(kHalfAMinute));
}

MutablePixelView PixelRing::map(Frame &frame, GLbitfield access) {
    auto const bytes = static_cast<std::size_t>(frame.buffer.size());
    if (!frame.memory) {
        BoundObjectScope bound(frame.buffer, ORU_BINDER(BindBuffer));
        frame.memory = ORU_GL(MapBufferRange, frame.buffer.target(), 0,
                              static_cast<GLsizeiptr>(bytes), access);
        bound.restore();
    }
    return {frame.memory, bytes, shape_};
}

void PixelRing::Unmap(Frame &frame) {
    GLenum const target = frame.buffer.target();
    bool isIntact = false;
    try {
        isIntact = ORU_GL(UnmapBuffer, target) != GL_FALSE;
    } catch (...) { // an error that was pending before ends the call when it is done
        GLint isMapped = 0;
        DropExceptions([&] { ORU_GL(GetBufferParameteriv, target, GL_BUFFER_MAPPED, &isMapped); });
        frame.memory = isMapped ? frame.memory : nullptr;
        throw;
    }
    frame.memory = nullptr;
    ORU_ASSERT_TEXT("A frame of a stream was lost while the host had it: begin it again", isIntact);
}

bool PixelRing::IsSupported() {
    return Buffer::IsSupported() && Supports(GL_ARB_MAP_BUFFER_RANGE) && Supports(GL_ARB_SYNC);
}

} // namespace ORU::OGL::internal
