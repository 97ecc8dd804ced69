// Frames on their way into textures.
#include "oru/oru_ogl/ogl/pixeluploadstream.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/internal/textures/pixelring.h"
#include "oru/oru_ogl/ogl/texture1.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"

#include <algorithm>

namespace ORU::OGL {

PixelUploadStream::PixelUploadStream(PixelShape const &shape, unsigned int frames)
    : ring_(ORU_NEW internal::PixelRing(shape, frames, Buffer::TYPE_PIXEL_UNPACK_BUFFER,
                                        Buffer::USAGE_STREAM_DRAW)) {}

PixelUploadStream::PixelUploadStream(PixelUploadStream &&other) noexcept = default;
PixelUploadStream &PixelUploadStream::operator=(PixelUploadStream &&other) noexcept = default;
PixelUploadStream::~PixelUploadStream() = default;

internal::PixelRing &PixelUploadStream::ring() const {
    ORU_ASSERT_TEXT("This pixel stream is empty: it was moved from. Use the one it was moved to",
                    ring_);
    return *ring_;
}

/// The place of a frame with which OpenGL is known to be done, or the number of frames. Nothing is
/// sent on its way for it: that would be once for each frame.
std::size_t PixelUploadStream::firstFree() const {
    internal::PixelRing &frames = ring();
    std::size_t i = 0;
    while (i < frames.size() && frames[i].fence && !frames[i].fence->isSignalled())
        ++i;
    return i;
}

bool PixelUploadStream::isFree() const {
    internal::PixelRing &frames = ring();
    return frames[0].memory || firstFree() < frames.size() || frames[frames.size() - 1].isFree();
}

MutablePixelView PixelUploadStream::begin() {
    internal::PixelRing &frames = ring();
    if (!frames[0].memory) {
        std::size_t const free = firstFree(), last = frames.size() - 1;
        if (free > last)
            internal::PixelRing::Wait(frames[last]);
        frames.move(std::min(free, last), 0);
    }
    internal::Frame &frame = frames[0];
    // A fence tells that OpenGL does not read the buffer any more: it need not look for itself, nor
    // take other memory.
    return frames.map(frame, GL_MAP_WRITE_BIT | (frame.fence ? GL_MAP_UNSYNCHRONIZED_BIT
                                                             : GL_MAP_INVALIDATE_BUFFER_BIT));
}

template<class AnyTexture, class... Place>
void PixelUploadStream::send(AnyTexture &texture, int level, Place... place) {
    internal::Frame &frame = ring()[0];
    ORU_ASSERT_TEXT("There is no frame to upload: call begin() and write what it returns",
                    frame.memory);
    internal::BoundObjectScope bound(frame.buffer, ORU_BINDER(BindBuffer));
    internal::PixelRing::Unmap(frame);
    frame.fence.reset();
    internal::Ending mark([&] { frame.fence.emplace(); });
    texture.upload(level, place..., ring().shape(), nullptr);
    bound.restore();
    mark.now();
}

void PixelUploadStream::upload(Texture1 &texture, int level, int x) {
    send(texture, level, x);
}

void PixelUploadStream::upload(Texture2 &texture, int level, int x, int y) {
    send(texture, level, x, y);
}

void PixelUploadStream::upload(Texture3 &texture, int level, int x, int y, int z) {
    send(texture, level, x, y, z);
}

bool PixelUploadStream::IsSupported() {
    return internal::PixelRing::IsSupported();
}

} // namespace ORU::OGL
