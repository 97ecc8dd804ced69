// Textures with one side.
#include "oru/oru_ogl/ogl/texture1.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"
#include "oru/oru_ogl/ogl/internal/textures/texturestorage.h"
#include "oru/oru_ogl/ogl/internal/textures/viewtransfer.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

using Part = internal::Part<1>;

void Send(Part const &part, GLenum format, GLenum type, void const *pixels) {
    ORU_GL(TexSubImage1D, part.target, part.level, part.first[0], part.sides[0], format, type,
           pixels);
}

} // namespace

Texture1::Texture1(Target target, TargetBinding binding, InternalFormat format, std::uint64_t width,
                   bool mipmapped)
    : Texture(target, binding, format, width, 1, 1) {
    if (!internal::CurrentRecord(&ExtensionManager::supportsNonPowerOfTwoTextures) &&
        !internal::ArePowersOfTwo(width)) // the check's text is what hosts see, with its "2"
        ORU_THROW_INTERNAL("Texture2::ctor hardware only supports power of two textures");

    internal::BoundObjectScope bound(*this, ORU_BINDER(BindTexture));
    auto const allocate = [&](GLint level, std::array<GLsizei, 1> const &sides) {
        ORU_GL(TexImage1D, this->target(), level, static_cast<GLint>(InternalFormat2GL(format)),
               sides[0], 0, getGLFormat(format), internal::StorageType(format), nullptr);
    };
    internal::ForEachLevel(internal::ToSides(width), 1, mipmapped, allocate);
    setFilter(FILTER_NEAREST, FILTER_NEAREST);
    setWrap(internal::NewTextureClamp());
    bound.restore();
}

Texture1::Texture1(Target target, TargetBinding binding, unsigned int name, ownership_tag ownership)
    : Texture(target, binding, name, ownership) {}

Texture1::~Texture1() = default;

void Texture1::setWrap(WrapMode s) {
    internal::RequireWrap(s);
    ORU_GL(TexParameteri, target(), GL_TEXTURE_WRAP_S, static_cast<GLint>(WrapMode2GL(s)));
}

void Texture1::checkPart(char const *operation, int level, std::uint64_t width) const {
    internal::CheckPart(operation, level, internal::Side{"width", "width", width, this->width(0)});
}

void Texture1::subImage(int level, int x, std::uint64_t width, Format format, Type type,
                        void const *data, PixelUnpackParameters const &params) {
    checkPart("subimage", level, width);
    internal::RequireSameKind(this->format(), format);
    internal::Upload(Send, Part{target(), level, {x}, internal::ToSides(width)}, format, type, data,
                     params);
    imageChanged(level);
}

void Texture1::subImage(int level, int x, std::uint64_t width, Format format, Type type,
                        Buffer *buffer, std::size_t offset, PixelUnpackParameters const &params) {
    checkPart("subimage", level, width);
    internal::RequireSameKind(this->format(), format);
    internal::Upload(Send, Part{target(), level, {x}, internal::ToSides(width)}, format, type,
                     buffer, offset, params);
    imageChanged(level);
}

void Texture1::subImage(int level, int x, PixelView const &pixels) {
    upload(level, x, pixels.shape(), pixels.data());
}

void Texture1::upload(int level, int x, PixelShape const &shape, void const *pixels) {
    checkPart("subimage", level, shape.width);
    internal::Upload(Send, Part{target(), level, {x}, internal::ToSides(shape.width)}, format(),
                     shape, pixels);
    imageChanged(level);
}

void Texture1::copyTexSubImage(int level, int xOffset, int x, int y, std::uint64_t width) {
    checkPart("copySubimage", level, width);
    ORU_GL(CopyTexSubImage1D, target(), level, xOffset, x, y, static_cast<GLsizei>(width));
    imageChanged(level);
}

void Texture1::getPixelData(void *dst, int level, unsigned int format, unsigned int type) const {
    ORU_GL(GetTexImage, target(), level, format, type, dst);
}

void Texture1::getPixelData(Buffer *buffer, int offset, int level, unsigned int format,
                            unsigned int type) const {
    ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, 1);
    internal::CheckBuffer(buffer);
    internal::BecomePackBuffer(*buffer);
    internal::ReadInto(*buffer, static_cast<std::uint64_t>(offset),
                       [&](void *pixels) { getPixelData(pixels, level, format, type); });
}

void Texture1::getPixelData(MutablePixelView const &pixels, int level) const {
    readLevel(level, pixels.shape(), pixels.data());
}

void Texture1::readLevel(int level, PixelShape const &shape, void *pixels) const {
    internal::CheckLevel(*this, target(), shape, level);
    internal::ReadLevel(target(), level, shape, pixels);
}

std::size_t Texture1::pixelDataSize(int /*level*/, Format format, Type type) const {
    return BytesPerPixel(format, type) * width(0);
}

Texture1D::Texture1D(InternalFormat format, std::uint64_t width, bool mipmapped)
    : Texture1(TARGET_TEXTURE_1D, TARGETBINDING_TEXTURE_BINDING_1D, format, width, mipmapped) {}

Texture1D::Texture1D(unsigned int name, ownership_tag ownership)
    : Texture1(TARGET_TEXTURE_1D, TARGETBINDING_TEXTURE_BINDING_1D, name, ownership) {}

} // namespace ORU::OGL
