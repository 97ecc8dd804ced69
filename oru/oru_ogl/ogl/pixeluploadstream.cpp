// Frames on their way into textures.
#include "oru/oru_ogl/ogl/pixeluploadstream.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/internal/textures/pixelring.h"
#include "oru/oru_ogl/ogl/texture1.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"

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

bool PixelUploadStream::isFree() const {
    return ring()[next_].isFree();
}

MutablePixelView PixelUploadStream::begin() {
    internal::Frame &frame = ring()[next_];
    GLbitfield access = GL_MAP_WRITE_BIT | GL_MAP_INVALIDATE_BUFFER_BIT;
    // A fence tells that OpenGL does not read the buffer any more: it need not look for itself.
    if (frame.fence)
        access |= GL_MAP_UNSYNCHRONIZED_BIT;
    return ring().map(frame, access);
}

template<class AnyTexture, class... Place>
void PixelUploadStream::send(AnyTexture &texture, int level, Place... place) {
    internal::Frame &frame = ring()[next_];
    ORU_ASSERT_TEXT("There is no frame to upload: call begin() and write what it returns",
                    frame.memory);
    ring().unmap(frame);
    internal::Ending mark([&] {
        ++next_;
        frame.fence.emplace();
    });
    internal::BoundObjectScope bound(frame.buffer, ORU_BINDER(BindBuffer));
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
