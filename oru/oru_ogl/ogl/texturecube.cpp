// Cube maps: six square images around a point.
#include "oru/oru_ogl/ogl/texturecube.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"
#include "oru/oru_ogl/ogl/internal/textures/texturestorage.h"
#include "oru/oru_ogl/ogl/internal/textures/viewtransfer.h"
#include "oru/oru_ogl/platformgl.h"

#include <iterator>

namespace ORU::OGL {

namespace {

using Part = internal::Part<2>;

constexpr std::uint64_t kFaceCount = std::size(kCubeFaces);

void Send(Part const &part, GLenum format, GLenum type, void const *pixels) {
    ORU_GL(TexSubImage2D, part.target, part.level, part.first[0], part.first[1], part.sides[0],
           part.sides[1], format, type, pixels);
}

} // namespace

TextureCube::TextureCube(InternalFormat format, std::uint64_t side, bool mipmapped)
    : Texture(TARGET_TEXTURE_CUBE_MAP, TARGETBINDING_TEXTURE_BINDING_CUBE_MAP, format, side, side,
              kFaceCount) {
    ORU_ASSERT_SUPPORTED(GL_VERSION_1_3);
    internal::BoundObjectScope bound(*this, ORU_BINDER(BindTexture));
    unsigned int const glInternalFormat = InternalFormat2GL(format);
    unsigned int const glFormat = getGLFormat(format);
    unsigned int const glType = internal::StorageType(format);
    auto const allocate = [&](GLint level, std::array<GLsizei, 2> const &sides) {
        for (Face const face : kCubeFaces)
            ORU_GL(TexImage2D, Face2GL(face), level, static_cast<GLint>(glInternalFormat), sides[0],
                   sides[1], 0, glFormat, glType, nullptr);
    };
    internal::ForEachLevel(internal::ToSides(side, side), 2, mipmapped, allocate);
    setFilter(FILTER_NEAREST, FILTER_NEAREST);
    setWrap(WRAPMODE_CLAMP_TO_EDGE, WRAPMODE_CLAMP_TO_EDGE, WRAPMODE_CLAMP_TO_EDGE);
    bound.restore();
}

TextureCube::TextureCube(unsigned int name, ownership_tag ownership)
    : Texture(TARGET_TEXTURE_CUBE_MAP, TARGETBINDING_TEXTURE_BINDING_CUBE_MAP, name, ownership) {}

TextureCube::~TextureCube() = default;

std::uint64_t TextureCube::depth(unsigned int /*level*/) const {
    return Texture::depth(0);
}

unsigned int TextureCube::Face2GL(Face face) {
    if (face >= kFaceCount)
        ORU_THROW_INTERNAL("A cube map has no face ", static_cast<unsigned int>(face),
                           ": they count from 0 to 5");
    return GL_TEXTURE_CUBE_MAP_POSITIVE_X + face;
}

void TextureCube::setWrap(WrapMode s, WrapMode t, WrapMode r) {
    internal::RequireWrap(s, t, r);
    ORU_GL(TexParameteri, target(), GL_TEXTURE_WRAP_S, static_cast<GLint>(WrapMode2GL(s)));
    ORU_GL(TexParameteri, target(), GL_TEXTURE_WRAP_T, static_cast<GLint>(WrapMode2GL(t)));
    ORU_GL(TexParameteri, target(), GL_TEXTURE_WRAP_R, static_cast<GLint>(WrapMode2GL(r)));
}

void TextureCube::checkPart(char const *operation, int level, std::uint64_t width,
                            std::uint64_t height) const {
    internal::CheckPart(operation, level, internal::Side{"width", "width", width, this->width(0)},
                        internal::Side{"height", "height", height, this->height(0)});
}

void TextureCube::requireBound() const {
    if (!isBound())
        ORU_THROW_INTERNAL("Texture must be bound");
}

void TextureCube::subImage(Face face, int level, int x, int y, std::uint64_t width,
                           std::uint64_t height, Format format, Type type, void const *data,
                           PixelUnpackParameters const &params) {
    checkPart("subimage", level, width, height);
    internal::RequireSameKind(this->format(), format);
    internal::Upload(Send, Part{Face2GL(face), level, {x, y}, internal::ToSides(width, height)},
                     format, type, data, params);
    imageChanged(level);
}

void TextureCube::subImage(Face face, int level, int x, int y, std::uint64_t width,
                           std::uint64_t height, Format format, Type type, Buffer *buffer,
                           std::size_t offset, PixelUnpackParameters const &params) {
    checkPart("subimage", level, width, height);
    internal::RequireSameKind(this->format(), format);
    internal::Upload(Send, Part{Face2GL(face), level, {x, y}, internal::ToSides(width, height)},
                     format, type, buffer, offset, params);
    imageChanged(level);
}

void TextureCube::subImage(Face face, int level, int x, int y, PixelView const &pixels) {
    PixelShape const &shape = pixels.shape();
    checkPart("subimage", level, shape.width, shape.height);
    auto const sides = internal::ToSides(shape.width, shape.height);
    internal::Upload(Send, Part{Face2GL(face), level, {x, y}, sides}, format(), shape,
                     pixels.data());
    imageChanged(level);
}

void TextureCube::compressedSubImage(Face face, int level, int x, int y, std::uint64_t width,
                                     std::uint64_t height, void const *data, std::size_t bytes) {
    checkPart("subimage", level, width, height);
    checkCompressed(width, height, 1, bytes);
    auto const sides = internal::ToSides(width, height, bytes);
    internal::KeepingUnpackState(PixelUnpackParameters(), [&] {
        ORU_GL(CompressedTexSubImage2D, Face2GL(face), level, x, y, sides[0], sides[1],
               InternalFormat2GL(format()), sides[2], data);
    });
    imageChanged(level);
}

void TextureCube::copyTexSubImage(Face face, int level, int xOffset, int yOffset, int x, int y,
                                  std::uint64_t width, std::uint64_t height) {
    checkPart("copySubimage", level, width, height);
    ORU_GL(CopyTexSubImage2D, Face2GL(face), level, xOffset, yOffset, x, y,
           static_cast<GLsizei>(width), static_cast<GLsizei>(height));
    imageChanged(level);
}

void TextureCube::getPixelData(Face face, void *dst, int level, Format format, Type type,
                               unsigned int alignment) const {
    requireBound();
    internal::RequireSameKind(this->format(), format);
    internal::PixelLayout const layout = internal::LayoutOf(format, type);
    internal::KeepingPackAlignment(alignment, [&] {
        ORU_GL(GetTexImage, Face2GL(face), level, layout.format, layout.type, dst);
    });
}

void TextureCube::getPixelData(Face face, Buffer *buffer, std::size_t offset, int level,
                               Format format, Type type, unsigned int alignment) const {
    requireBound();
    internal::CheckBuffer(buffer);
    internal::CheckByteAlignment(alignment);
    internal::RequireSameKind(this->format(), format);
    internal::PixelLayout const layout = internal::LayoutOf(format, type);
    GLenum const image = Face2GL(face);
    internal::BecomePackBuffer(*buffer);
    internal::KeepingPackAlignment(alignment, [&] {
        internal::ReadInto(*buffer, offset, [&](void *pixels) {
            ORU_GL(GetTexImage, image, level, layout.format, layout.type, pixels);
        });
    });
}

void TextureCube::getPixelData(Face face, MutablePixelView const &pixels, int level) const {
    GLenum const image = Face2GL(face);
    internal::CheckLevel(*this, image, pixels.shape(), level);
    internal::ReadLevel(image, level, pixels.shape(), pixels.data());
}

void TextureCube::getCompressedData(Face face, void *dst, std::size_t bytes, int level) const {
    requireBound();
    checkCompressedLevel(level, 1, bytes);
    internal::ReadBlocks(Face2GL(face), level, dst, bytes);
}

std::size_t TextureCube::pixelDataSize(Format format, Type type) const {
    return BytesPerPixel(format, type) * width(0) * height(0);
}

bool TextureCube::IsSupported() {
    return internal::Supports(GL_VERSION_1_3);
}

} // namespace ORU::OGL
