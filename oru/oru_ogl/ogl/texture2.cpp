// Textures with two sides.
#include "oru/oru_ogl/ogl/texture2.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"
#include "oru/oru_ogl/ogl/internal/textures/texturestorage.h"
#include "oru/oru_ogl/ogl/internal/textures/viewtransfer.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

using Part = internal::Part<2>;

void Send(Part const &part, GLenum format, GLenum type, void const *pixels) {
    ORU_GL(TexSubImage2D, part.target, part.level, part.first[0], part.first[1], part.sides[0],
           part.sides[1], format, type, pixels);
}

/// Whether an upload takes the caller's memory for the texture's own storage. Where the storage is
/// kept is a parameter of the rectangle target, whichever target the upload is for.
void UseClientStorage(bool use) {
    ORU_GL(TexParameteri, GL_TEXTURE_RECTANGLE, GL_TEXTURE_STORAGE_HINT_APPLE,
           use ? GL_STORAGE_CACHED_APPLE : GL_STORAGE_PRIVATE_APPLE);
    ORU_GL(PixelStorei, GL_UNPACK_CLIENT_STORAGE_APPLE, use ? 1 : 0);
}

} // namespace

Texture2::Texture2(Target target, TargetBinding binding, InternalFormat format, std::uint64_t width,
                   std::uint64_t height, bool mipmapped, void *clientStorage, Type type)
    : Texture(target, binding, format, width, height, 1), clientStorage_(clientStorage) {
    if (!internal::CurrentRecord(&ExtensionManager::supportsNonPowerOfTwoTextures) &&
        !internal::Supports(GL_ARB_TEXTURE_RECTANGLE) && !internal::ArePowersOfTwo(width, height))
        ORU_THROW_INTERNAL("Texture2::ctor hardware only supports power of two textures");

    internal::BoundObjectScope bound(*this, ORU_BINDER(BindTexture));
    if (clientStorage_)
        ORU_ASSERT_SUPPORTED(GL_APPLE_CLIENT_STORAGE);
    internal::Ending endClientStorage([this] {
        if (clientStorage_)
            UseClientStorage(false);
    });
    if (clientStorage_)
        UseClientStorage(true);
    allocate(mipmapped, type);
    setFilter(FILTER_NEAREST, FILTER_NEAREST);
    WrapMode const wrap = internal::NewTextureClamp();
    setWrap(wrap, wrap);
    endClientStorage.now();
    bound.restore();
}

Texture2::Texture2(Target target, TargetBinding binding, unsigned int name, ownership_tag ownership)
    : Texture(target, binding, name, ownership) {}

Texture2::~Texture2() = default;

void Texture2::allocate(bool mipmapped, Type type) {
    auto const glInternalFormat = static_cast<GLint>(InternalFormat2GL(format()));
    unsigned int const glFormat = getGLFormat(format());
    unsigned int const glType = type == TYPE_NONE ? internal::StorageType(format()) : Type2GL(type);
    bool const layered = target() == GL_TEXTURE_1D_ARRAY;
    auto const allocateLevel = [&](GLint level, std::array<GLsizei, 2> const &sides) {
        ORU_GL(TexImage2D, target(), level, glInternalFormat, sides[0], sides[1], 0, glFormat,
               glType, clientStorage_);
    };
    internal::ForEachLevel(internal::ToSides(width(0), height(0)), layered ? 1 : 2, mipmapped,
                           allocateLevel);
}

void Texture2::setWrap(WrapMode s, WrapMode t) {
    if (!isBound())
        ORU_THROW_INTERNAL("Texture must be enabled (bound & active)");
    internal::RequireWrap(s, t);
    ORU_GL(TexParameteri, target(), GL_TEXTURE_WRAP_S, static_cast<GLint>(WrapMode2GL(s)));
    ORU_GL(TexParameteri, target(), GL_TEXTURE_WRAP_T, static_cast<GLint>(WrapMode2GL(t)));
}

void Texture2::checkPart(char const *operation, int level, std::uint64_t width,
                         std::uint64_t height) const {
    internal::CheckPart(operation, level, internal::Side{"width", "width", width, this->width(0)},
                        internal::Side{"height", "height", height, this->height(0)});
}

void Texture2::subImage(int level, int x, int y, std::uint64_t width, std::uint64_t height,
                        Format format, Type type, void const *data,
                        PixelUnpackParameters const &params) {
    checkPart("subimage", level, width, height);
    internal::RequireSameKind(this->format(), format);
    internal::Upload(Send, Part{target(), level, {x, y}, internal::ToSides(width, height)}, format,
                     type, data, params);
    imageChanged(level);
}

void Texture2::subImage(int level, int x, int y, std::uint64_t width, std::uint64_t height,
                        Format format, Type type, Buffer *buffer, std::size_t offset,
                        PixelUnpackParameters const &params) {
    checkPart("subimage", level, width, height);
    internal::RequireSameKind(this->format(), format);
    internal::Upload(Send, Part{target(), level, {x, y}, internal::ToSides(width, height)}, format,
                     type, buffer, offset, params);
    imageChanged(level);
}

void Texture2::subImage(int level, int x, int y, PixelView const &pixels) {
    upload(level, x, y, pixels.shape(), pixels.data());
}

void Texture2::upload(int level, int x, int y, PixelShape const &shape, void const *pixels) {
    checkPart("subimage", level, shape.width, shape.height);
    internal::Upload(Send,
                     Part{target(), level, {x, y}, internal::ToSides(shape.width, shape.height)},
                     format(), shape, pixels);
    imageChanged(level);
}

void Texture2::compressedSubImage(int level, int x, int y, std::uint64_t width,
                                  std::uint64_t height, void const *data, std::size_t bytes) {
    checkPart("subimage", level, width, height);
    checkCompressed(width, height, 1, bytes);
    auto const sides = internal::ToSides(width, height, bytes);
    internal::KeepingUnpackState(PixelUnpackParameters(), [&] {
        ORU_GL(CompressedTexSubImage2D, target(), level, x, y, sides[0], sides[1],
               InternalFormat2GL(format()), sides[2], data);
    });
    imageChanged(level);
}

void Texture2::getCompressedData(void *dst, std::size_t bytes, int level) const {
    if (!isBound())
        ORU_THROW_INTERNAL("Texture must be bound");
    checkCompressedLevel(level, 1, bytes);
    internal::ReadBlocks(target(), level, dst, bytes);
}

void Texture2::copyTexSubImage(int level, int xOffset, int yOffset, int x, int y,
                               std::uint64_t width, std::uint64_t height) {
    checkPart("copySubimage", level, width, height);
    ORU_GL(CopyTexSubImage2D, target(), level, xOffset, yOffset, x, y, static_cast<GLsizei>(width),
           static_cast<GLsizei>(height));
    imageChanged(level);
}

void Texture2::getPixelData(void *dst, int level, Format format, Type type,
                            unsigned int alignment) const {
    if (!isBound())
        ORU_THROW_INTERNAL("Texture must be bound");
    if (format == FORMAT_COLOR_INDEX)
        ORU_THROW_INTERNAL("COLOR_INDEX not allowed here!");
    internal::RequireSameKind(this->format(), format);
    internal::PixelLayout const layout = internal::LayoutOf(format, type);
    internal::WithPackAlignment(
        alignment, [&] { ORU_GL(GetTexImage, target(), level, layout.format, layout.type, dst); });
}

void Texture2::getPixelData(Buffer *buffer, std::size_t offset, int level, Format format, Type type,
                            unsigned int alignment) const {
    if (!isBound())
        ORU_THROW_INTERNAL("Texture must be bound");
    internal::CheckBuffer(buffer);
    if (format == FORMAT_COLOR_INDEX)
        ORU_THROW_INTERNAL("COLOR_INDEX not allowed here!");
    internal::CheckByteAlignment(alignment);
    internal::RequireSameKind(this->format(), format);
    internal::PixelLayout const layout = internal::LayoutOf(format, type);
    internal::BecomePackBuffer(*buffer);
    internal::WithPackAlignment(alignment, [&] {
        internal::ReadInto(*buffer, offset, [&](void *pixels) {
            ORU_GL(GetTexImage, target(), level, layout.format, layout.type, pixels);
        });
    });
}

void Texture2::getPixelData(MutablePixelView const &pixels, int level) const {
    readLevel(level, pixels.shape(), pixels.data());
}

void Texture2::readLevel(int level, PixelShape const &shape, void *pixels) const {
    internal::CheckLevel(*this, target(), shape, level);
    internal::ReadLevel(target(), level, shape, pixels);
}

std::size_t Texture2::pixelDataSize(int /*level*/, Format format, Type type) const {
    return BytesPerPixel(format, type) * width(0) * height(0);
}

Texture2D::Texture2D(InternalFormat format, std::uint64_t width, std::uint64_t height,
                     bool mipmapped, void *clientStorage, Type type)
    : Texture2(TARGET_TEXTURE_2D, TARGETBINDING_TEXTURE_BINDING_2D, format, width, height,
               mipmapped, clientStorage, type) {}

Texture2D::Texture2D(unsigned int name, ownership_tag ownership)
    : Texture2(TARGET_TEXTURE_2D, TARGETBINDING_TEXTURE_BINDING_2D, name, ownership) {}

TextureRECT::TextureRECT(InternalFormat format, std::uint64_t width, std::uint64_t height,
                         void *clientStorage, Type type)
    : Texture2(TARGET_TEXTURE_RECTANGLE, TARGETBINDING_TEXTURE_BINDING_RECTANGLE, format, width,
               height, false, clientStorage, type) {}

TextureRECT::TextureRECT(unsigned int name, ownership_tag ownership)
    : Texture2(TARGET_TEXTURE_RECTANGLE, TARGETBINDING_TEXTURE_BINDING_RECTANGLE, name, ownership) {
}

bool TextureRECT::IsSupported() {
    return internal::Supports(GL_ARB_TEXTURE_RECTANGLE);
}

Texture1DArray::Texture1DArray(InternalFormat format, std::uint64_t width, std::uint64_t layers,
                               bool mipmapped)
    : Texture2(TARGET_TEXTURE_1D_ARRAY, TARGETBINDING_TEXTURE_BINDING_1D_ARRAY, format, width,
               layers, mipmapped, nullptr, TYPE_NONE) {}

Texture1DArray::Texture1DArray(unsigned int name, ownership_tag ownership)
    : Texture2(TARGET_TEXTURE_1D_ARRAY, TARGETBINDING_TEXTURE_BINDING_1D_ARRAY, name, ownership) {}

std::uint64_t Texture1DArray::depth(unsigned int /*level*/) const {
    return Texture::depth(0);
}

} // namespace ORU::OGL
