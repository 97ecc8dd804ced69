// Frames on their way out of framebuffers and textures.
#include "oru/oru_ogl/ogl/pixelreadstream.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/textures/pixelring.h"
#include "oru/oru_ogl/ogl/internal/textures/texturestorage.h"
#include "oru/oru_ogl/ogl/internal/textures/viewtransfer.h"
#include "oru/oru_ogl/ogl/texture1.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"

namespace ORU::OGL {

PixelReadStream::PixelReadStream(PixelShape const &shape, unsigned int frames)
    : ring_(ORU_NEW internal::PixelRing(shape, frames, Buffer::TYPE_PIXEL_PACK_BUFFER,
                                        Buffer::USAGE_STREAM_READ)) {}

PixelReadStream::PixelReadStream(PixelReadStream &&other) noexcept = default;
PixelReadStream &PixelReadStream::operator=(PixelReadStream &&other) noexcept = default;
PixelReadStream::~PixelReadStream() = default;

internal::PixelRing &PixelReadStream::ring() const {
    ORU_ASSERT_TEXT("This pixel stream is empty: it was moved from. Use the one it was moved to",
                    ring_);
    return *ring_;
}

template<class Read>
void PixelReadStream::ask(Read read) {
    ORU_ASSERT_TEXT("All frames of the stream wait to be taken: begin() and end() the oldest first",
                    !isFull());
    internal::Frame &frame = ring()[count_];
    internal::ReadInto(frame.buffer, 0, read);
    frame.fence.emplace();
    ++count_;
}

void PixelReadStream::read(int x, int y) {
    PixelShape const &shape = ring().shape();
    internal::CheckSides(shape, 2);
    internal::PixelLayout const layout = internal::LayoutOf(shape.format, shape.type);
    auto const sides = internal::ToSides(shape.width, shape.height);
    std::uint64_t const row = shape.rowBytes();
    ask([&](void *) {
        internal::WithPackState(shape, [&] {
            internal::ForEachBand(shape.height, row, [&](std::uint64_t first, std::uint64_t count) {
                ORU_GL(ReadPixels, x, y + static_cast<GLint>(first), sides[0],
                       static_cast<GLsizei>(count), layout.format, layout.type,
                       internal::BufferOffset(first * row));
            });
        });
    });
}

void PixelReadStream::read(Texture1 const &texture, int level) {
    ask([&](void *pixels) { texture.readLevel(level, ring().shape(), pixels); });
}

void PixelReadStream::read(Texture2 const &texture, int level) {
    ask([&](void *pixels) { texture.readLevel(level, ring().shape(), pixels); });
}

void PixelReadStream::read(Texture3 const &texture, int level) {
    ask([&](void *pixels) { texture.readLevel(level, ring().shape(), pixels); });
}

bool PixelReadStream::isFull() const {
    return count_ == ring().size();
}

bool PixelReadStream::isReady() const {
    return count_ > 0 && ring()[0].isFree();
}

PixelView PixelReadStream::begin() {
    internal::PixelRing &frames = ring();
    ORU_ASSERT_TEXT("No frame of the stream was asked for: call read() before begin()", count_ > 0);
    if (!frames[0].memory)
        internal::PixelRing::Wait(frames[0]);
    return frames.map(frames[0], GL_MAP_READ_BIT);
}

void PixelReadStream::end() {
    internal::PixelRing &frames = ring();
    internal::Frame &frame = frames[0];
    ORU_ASSERT_TEXT("The host has no frame of the stream: call begin() before end()",
                    count_ > 0 && frame.memory);
    internal::BoundObjectScope bound(frame.buffer, ORU_BINDER(BindBuffer));
    internal::PixelRing::Unmap(frame);
    frames.move(0, --count_);
    bound.restore();
}

bool PixelReadStream::IsSupported() {
    return internal::PixelRing::IsSupported();
}

} // namespace ORU::OGL
