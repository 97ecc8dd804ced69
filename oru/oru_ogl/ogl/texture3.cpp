// Textures with three sides.
#include "oru/oru_ogl/ogl/texture3.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"
#include "oru/oru_ogl/ogl/internal/textures/texturestorage.h"
#include "oru/oru_ogl/ogl/internal/textures/viewtransfer.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

using Part = internal::Part<3>;

void Send(Part const &part, GLenum format, GLenum type, void const *pixels) {
    ORU_GL(TexSubImage3D, part.target, part.level, part.first[0], part.first[1], part.first[2],
           part.sides[0], part.sides[1], part.sides[2], format, type, pixels);
}

} // namespace

/// The part of construction that both ways share: `allocate` runs with the texture bound.
template<class Allocate>
void Texture3::initialize(Allocate allocate) {
    if (!internal::CurrentRecord(&ExtensionManager::supportsNonPowerOfTwoTextures) &&
        !internal::ArePowersOfTwo(width(0), height(0), Texture::depth(0)))
        ORU_THROW_INTERNAL("Texture3::ctor hardware only supports power of two textures");

    internal::BoundObjectScope bound(*this, ORU_BINDER(BindTexture));
    allocate(internal::ToSides(width(0), height(0), Texture::depth(0)));
    setFilter(FILTER_NEAREST, FILTER_NEAREST);
    WrapMode const wrap = internal::NewTextureClamp();
    setWrap(wrap, wrap, wrap);
    bound.restore();
}

Texture3::Texture3(Target target, TargetBinding binding, InternalFormat format, std::uint64_t width,
                   std::uint64_t height, std::uint64_t depth, bool mipmapped)
    : Texture(target, binding, format, width, height, depth) {
    std::size_t const halved = target == TARGET_TEXTURE_3D ? 3 : 2;
    initialize([&](std::array<GLsizei, 3> const &level0) {
        auto const glInternalFormat = static_cast<GLint>(InternalFormat2GL(format));
        unsigned int const glFormat = getGLFormat(format);
        internal::ForEachLevel(
            level0, halved, mipmapped, [&](GLint level, std::array<GLsizei, 3> const &sides) {
                ORU_GL(TexImage3D, this->target(), level, glInternalFormat, sides[0], sides[1],
                       sides[2], 0, glFormat, internal::StorageType(format), nullptr);
            });
    });
}

Texture3::Texture3(Target target, TargetBinding binding, InternalFormat format, int level,
                   std::uint64_t width, std::uint64_t height, std::uint64_t depth,
                   Format clientFormat, Type type, void const *data,
                   PixelUnpackParameters const &params)
    : Texture(target, binding, format, width, height, depth) {
    initialize([&](std::array<GLsizei, 3> const &sides) {
        auto const glInternalFormat = static_cast<GLint>(InternalFormat2GL(format));
        auto const [glFormat, glType] = internal::LayoutOf(clientFormat, type);
        internal::PixelStorageScope saved(internal::kUnpackStorage);
        internal::Ending restoreUnpackState([&] { saved.restore(); });
        params.apply();
        ORU_GL(TexImage3D, this->target(), level, glInternalFormat, sides[0], sides[1], sides[2], 0,
               glFormat, glType, data);
        restoreUnpackState.now();
    });
}

Texture3::Texture3(Target target, TargetBinding binding, unsigned int name, ownership_tag ownership)
    : Texture(target, binding, name, ownership) {}

Texture3::~Texture3() = default;

void Texture3::setWrap(WrapMode s, WrapMode t, WrapMode r) {
    internal::RequireWrap(s, t, r);
    ORU_GL(TexParameteri, target(), GL_TEXTURE_WRAP_S, static_cast<GLint>(WrapMode2GL(s)));
    ORU_GL(TexParameteri, target(), GL_TEXTURE_WRAP_T, static_cast<GLint>(WrapMode2GL(t)));
    ORU_GL(TexParameteri, target(), GL_TEXTURE_WRAP_R, static_cast<GLint>(WrapMode2GL(r)));
}

void Texture3::checkPart(int level, std::uint64_t width, std::uint64_t height,
                         std::uint64_t depth) const {
    internal::CheckPart("subimage", level, internal::Side{"width", "width ", width, this->width(0)},
                        internal::Side{"height", "height", height, this->height(0)},
                        internal::Side{"depth", "depth ", depth, this->depth(0)});
}

void Texture3::subImage(int level, int x, int y, int z, std::uint64_t width, std::uint64_t height,
                        std::uint64_t depth, Format format, Type type, void const *data,
                        PixelUnpackParameters const &params) {
    checkPart(level, width, height, depth);
    internal::RequireSameKind(this->format(), format);
    internal::Upload(Send,
                     Part{target(), level, {x, y, z}, internal::ToSides(width, height, depth)},
                     format, type, data, params);
    imageChanged(level);
}

void Texture3::subImage(int level, int x, int y, int z, std::uint64_t width, std::uint64_t height,
                        std::uint64_t depth, Format format, Type type, Buffer *buffer,
                        std::size_t offset, PixelUnpackParameters const &params) {
    checkPart(level, width, height, depth);
    internal::RequireSameKind(this->format(), format);
    internal::Upload(Send,
                     Part{target(), level, {x, y, z}, internal::ToSides(width, height, depth)},
                     format, type, buffer, offset, params);
    imageChanged(level);
}

void Texture3::subImage(int level, int x, int y, int z, PixelView const &pixels) {
    upload(level, x, y, z, pixels.shape(), pixels.data());
}

void Texture3::upload(int level, int x, int y, int z, PixelShape const &shape, void const *pixels) {
    checkPart(level, shape.width, shape.height, shape.depth);
    auto const sides = internal::ToSides(shape.width, shape.height, shape.depth);
    internal::Upload(Send, Part{target(), level, {x, y, z}, sides}, format(), shape, pixels);
    imageChanged(level);
}

void Texture3::compressedSubImage(int level, int x, int y, int z, std::uint64_t width,
                                  std::uint64_t height, std::uint64_t depth, void const *data,
                                  std::size_t bytes) {
    checkPart(level, width, height, depth);
    checkCompressed(width, height, depth, bytes);
    auto const sides = internal::ToSides(width, height, depth, bytes);
    internal::KeepingUnpackState(PixelUnpackParameters(), [&] {
        ORU_GL(CompressedTexSubImage3D, target(), level, x, y, z, sides[0], sides[1], sides[2],
               InternalFormat2GL(format()), sides[3], data);
    });
    imageChanged(level);
}

void Texture3::getCompressedData(void *dst, std::size_t bytes, int level) const {
    if (!isBound())
        ORU_THROW_INTERNAL("Texture must be bound");
    checkCompressedLevel(level, depth(static_cast<unsigned int>(level)), bytes);
    internal::ReadBlocks(target(), level, dst, bytes);
}

void Texture3::copyTexSubImage(int level, int xOffset, int yOffset, int zOffset, int x, int y,
                               std::uint64_t width, std::uint64_t height) {
    internal::CheckPart("copySubimage", level,
                        internal::Side{"width", "width", width, this->width(0)},
                        internal::Side{"height", "height", height, this->height(0)});
    ORU_GL(CopyTexSubImage3D, target(), level, xOffset, yOffset, zOffset, x, y,
           static_cast<GLsizei>(width), static_cast<GLsizei>(height));
    imageChanged(level);
}

void Texture3::getPixelData(void *dst, int level, Format format, Type type,
                            unsigned int alignment) const {
    if (format == FORMAT_COLOR_INDEX)
        ORU_THROW_INTERNAL("COLOR_INDEX not allowed here!");
    internal::RequireSameKind(this->format(), format);
    internal::PixelLayout const layout = internal::LayoutOf(format, type);
    internal::WithPackAlignment(
        alignment, [&] { ORU_GL(GetTexImage, target(), level, layout.format, layout.type, dst); });
}

void Texture3::getPixelData(Buffer *buffer, int offset, int level, Format format, Type type,
                            unsigned int alignment) const {
    internal::CheckBuffer(buffer);
    internal::CheckByteAlignment(alignment);
    internal::RequireSameKind(this->format(), format);
    internal::PixelLayout const layout = internal::LayoutOf(format, type);
    internal::BecomePackBuffer(*buffer);
    internal::WithPackAlignment(alignment, [&] {
        internal::ReadInto(*buffer, static_cast<std::uint64_t>(offset), [&](void *pixels) {
            ORU_GL(GetTexImage, target(), level, layout.format, layout.type, pixels);
        });
    });
}

void Texture3::getPixelData(MutablePixelView const &pixels, int level) const {
    readLevel(level, pixels.shape(), pixels.data());
}

void Texture3::readLevel(int level, PixelShape const &shape, void *pixels) const {
    internal::CheckLevel(*this, target(), shape, level);
    internal::ReadLevel(target(), level, shape, pixels);
}

std::size_t Texture3::pixelDataSize(int /*level*/, Format format, Type type) const {
    return BytesPerPixel(format, type) * width(0) * height(0) * depth(0);
}

Texture3D::Texture3D(InternalFormat format, std::uint64_t width, std::uint64_t height,
                     std::uint64_t depth, bool mipmapped)
    : Texture3(TARGET_TEXTURE_3D, TARGETBINDING_TEXTURE_BINDING_3D, format, width, height, depth,
               mipmapped) {}

Texture3D::Texture3D(InternalFormat format, int level, std::uint64_t width, std::uint64_t height,
                     std::uint64_t depth, Format clientFormat, Type type, void const *data,
                     PixelUnpackParameters const &params)
    : Texture3(TARGET_TEXTURE_3D, TARGETBINDING_TEXTURE_BINDING_3D, format, level, width, height,
               depth, clientFormat, type, data, params) {}

Texture3D::Texture3D(unsigned int name, ownership_tag ownership)
    : Texture3(TARGET_TEXTURE_3D, TARGETBINDING_TEXTURE_BINDING_3D, name, ownership) {}

Texture2DArray::Texture2DArray(InternalFormat format, std::uint64_t width, std::uint64_t height,
                               std::uint64_t layers, bool mipmapped)
    : Texture3(TARGET_TEXTURE_2D_ARRAY, TARGETBINDING_TEXTURE_BINDING_2D_ARRAY, format, width,
               height, layers, mipmapped) {}

Texture2DArray::Texture2DArray(unsigned int name, ownership_tag ownership)
    : Texture3(TARGET_TEXTURE_2D_ARRAY, TARGETBINDING_TEXTURE_BINDING_2D_ARRAY, name, ownership) {}

namespace {

/// Layers of an array of cubes, before any call.
std::uint64_t LayersOf(std::uint64_t cubes) {
    ORU_ASSERT_SUPPORTED(GL_ARB_TEXTURE_CUBE_MAP_ARRAY);
    return 6 * cubes;
}

} // namespace

TextureCubeArray::TextureCubeArray(InternalFormat format, std::uint64_t side, std::uint64_t cubes,
                                   bool mipmapped)
    : Texture3(TARGET_TEXTURE_CUBE_MAP_ARRAY, TARGETBINDING_TEXTURE_BINDING_CUBE_MAP_ARRAY, format,
               side, side, LayersOf(cubes), mipmapped) {}

TextureCubeArray::TextureCubeArray(unsigned int name, ownership_tag ownership)
    : Texture3(TARGET_TEXTURE_CUBE_MAP_ARRAY, TARGETBINDING_TEXTURE_BINDING_CUBE_MAP_ARRAY, name,
               ownership) {}

std::uint64_t TextureCubeArray::depth(unsigned int /*level*/) const {
    return Texture::depth(0);
}

bool TextureCubeArray::IsSupported() {
    return internal::Supports(GL_ARB_TEXTURE_CUBE_MAP_ARRAY);
}

std::uint64_t Texture2DArray::depth(unsigned int /*level*/) const {
    return Texture::depth(0);
}

} // namespace ORU::OGL
