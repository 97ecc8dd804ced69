// What all textures have in common.
#include "oru/oru_ogl/ogl/texture.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/objects/translation.h"
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"
#include "oru/oru_ogl/platformgl.h"

#include <ostream>

namespace ORU::OGL {

namespace {

#define ORU_ROW(Name)                                                                              \
    { Texture::TARGET_##Name, GL_##Name }
constexpr internal::Translation<Texture::Target, 6> kTargets = {
    ORU_TRANSLATION_FAILURE("Target enums are not all properly translated."),
    {ORU_ROW(TEXTURE_1D), ORU_ROW(TEXTURE_2D), ORU_ROW(TEXTURE_3D), ORU_ROW(TEXTURE_1D_ARRAY),
     ORU_ROW(TEXTURE_2D_ARRAY), ORU_ROW(TEXTURE_RECTANGLE)}};
#undef ORU_ROW
static_assert(kTargets.isInOrder());

#define ORU_ROW(Name)                                                                              \
    { Texture::TARGETBINDING_##Name, GL_##Name }
constexpr internal::Translation<Texture::TargetBinding, 6> kTargetBindings = {
    ORU_TRANSLATION_FAILURE("Target enums are not all properly translated."),
    {ORU_ROW(TEXTURE_BINDING_1D), ORU_ROW(TEXTURE_BINDING_2D), ORU_ROW(TEXTURE_BINDING_3D),
     ORU_ROW(TEXTURE_BINDING_1D_ARRAY), ORU_ROW(TEXTURE_BINDING_2D_ARRAY),
     ORU_ROW(TEXTURE_BINDING_RECTANGLE)}};
#undef ORU_ROW
static_assert(kTargetBindings.isInOrder());

struct InternalFormatRow {
    Texture::InternalFormat value;
    unsigned int gl;
    char const *name;
    unsigned int channels; ///< 0 for a format without a size
    unsigned int bytes;    ///< of a channel, 0 where the channels are of different or broken sizes
};

#define ORU_ROW(Name, Channels, Bytes)                                                             \
    { Texture::INTERNALFORMAT_##Name, GL_##Name, "INTERNALFORMAT_" #Name, Channels, Bytes }
// clang-format off
constexpr internal::Translation<Texture::InternalFormat, 58, InternalFormatRow> kInternalFormats = {
    ORU_TRANSLATION_FAILURE("InternalFormat enums are not all properly translated."),
    {
        ORU_ROW(ALPHA, 1, 1),
        ORU_ROW(ALPHA4, 1, 0),
        ORU_ROW(ALPHA8, 1, 1),
        ORU_ROW(ALPHA12, 1, 0),
        ORU_ROW(ALPHA16, 1, 2),
        ORU_ROW(LUMINANCE, 1, 1),
        ORU_ROW(LUMINANCE4, 1, 0),
        ORU_ROW(LUMINANCE8, 1, 1),
        ORU_ROW(LUMINANCE12, 1, 0),
        ORU_ROW(LUMINANCE16, 1, 2),
        ORU_ROW(LUMINANCE_ALPHA, 2, 1),
        ORU_ROW(LUMINANCE4_ALPHA4, 2, 0),
        ORU_ROW(LUMINANCE6_ALPHA2, 2, 0),
        ORU_ROW(LUMINANCE8_ALPHA8, 2, 1),
        ORU_ROW(LUMINANCE12_ALPHA4, 2, 0),
        ORU_ROW(LUMINANCE12_ALPHA12, 2, 0),
        ORU_ROW(LUMINANCE16_ALPHA16, 2, 2),
        ORU_ROW(INTENSITY, 1, 1),
        ORU_ROW(INTENSITY4, 1, 0),
        ORU_ROW(INTENSITY8, 1, 1),
        ORU_ROW(INTENSITY12, 1, 0),
        ORU_ROW(INTENSITY16, 1, 2),
        ORU_ROW(R3_G3_B2, 3, 0),
        ORU_ROW(RED, 1, 1),
        ORU_ROW(R16, 1, 2),
        ORU_ROW(R16F, 1, 2),
        ORU_ROW(R32F, 1, 4),
        ORU_ROW(RG, 2, 1),
        ORU_ROW(RG16, 2, 2),
        ORU_ROW(RG16F, 2, 2),
        ORU_ROW(RG32F, 2, 4),
        ORU_ROW(RGB, 3, 1),
        ORU_ROW(RGB4, 0, 0),
        ORU_ROW(RGB5, 3, 0),
        ORU_ROW(RGB8, 3, 1),
        ORU_ROW(RGB10, 3, 0),
        ORU_ROW(RGB12, 3, 0),
        ORU_ROW(RGB16, 3, 2),
        ORU_ROW(RGBA, 4, 1),
        ORU_ROW(RGBA2, 4, 0),
        ORU_ROW(RGBA4, 4, 0),
        ORU_ROW(RGB5_A1, 4, 0),
        ORU_ROW(RGBA8, 4, 1),
        ORU_ROW(RGB10_A2, 4, 0),
        ORU_ROW(RGBA12, 4, 0),
        ORU_ROW(RGBA16, 4, 2),
        ORU_ROW(RGBA32F_ARB, 4, 4),
        ORU_ROW(RGB32F_ARB, 3, 4),
        ORU_ROW(ALPHA32F_ARB, 1, 4),
        ORU_ROW(INTENSITY32F_ARB, 1, 4),
        ORU_ROW(LUMINANCE32F_ARB, 1, 4),
        ORU_ROW(LUMINANCE_ALPHA32F_ARB, 2, 4),
        ORU_ROW(RGBA16F_ARB, 4, 2),
        ORU_ROW(RGB16F_ARB, 3, 2),
        ORU_ROW(ALPHA16F_ARB, 1, 2),
        ORU_ROW(INTENSITY16F_ARB, 1, 2),
        ORU_ROW(LUMINANCE16F_ARB, 1, 2),
        ORU_ROW(LUMINANCE_ALPHA16F_ARB, 2, 2),
    }};
// clang-format on
#undef ORU_ROW
static_assert(kInternalFormats.isInOrder());

struct FormatRow {
    Texture::Format value;
    unsigned int gl;
    unsigned int channels;
};

#define ORU_ROW(Name, Channels)                                                                    \
    { Texture::FORMAT_##Name, GL_##Name, Channels }
constexpr internal::Translation<Texture::Format, 12, FormatRow> kFormats = {
    ORU_TRANSLATION_FAILURE("Format enums are not all properly translated."),
    {ORU_ROW(COLOR_INDEX, 1), ORU_ROW(RED, 1), ORU_ROW(GREEN, 1), ORU_ROW(BLUE, 1),
     ORU_ROW(ALPHA, 1), ORU_ROW(RG, 2), ORU_ROW(RGB, 3), ORU_ROW(BGR, 3), ORU_ROW(RGBA, 4),
     ORU_ROW(BGRA, 4), ORU_ROW(LUMINANCE, 1), ORU_ROW(LUMINANCE_ALPHA, 2)}};
#undef ORU_ROW
static_assert(kFormats.isInOrder());

struct TypeRow {
    Texture::Type value;
    unsigned int gl;
    unsigned int bytes; ///< of a component, 0 where transfers are not sized by it
};

#define ORU_ROW(Name, Bytes)                                                                       \
    { Texture::TYPE_##Name, GL_##Name, Bytes }
constexpr internal::Translation<Texture::Type, 21, TypeRow> kTypes = {
    ORU_TRANSLATION_FAILURE("Type enums are not all properly translated."),
    {ORU_ROW(UNSIGNED_BYTE, 1),
     ORU_ROW(BYTE, 1),
     ORU_ROW(BITMAP, 0),
     ORU_ROW(UNSIGNED_SHORT, 2),
     ORU_ROW(SHORT, 2),
     ORU_ROW(UNSIGNED_INT, 0),
     ORU_ROW(INT, 0),
     ORU_ROW(FLOAT, 4),
     ORU_ROW(UNSIGNED_BYTE_3_3_2, 0),
     ORU_ROW(UNSIGNED_BYTE_2_3_3_REV, 0),
     ORU_ROW(UNSIGNED_SHORT_5_6_5, 0),
     ORU_ROW(UNSIGNED_SHORT_5_6_5_REV, 0),
     ORU_ROW(UNSIGNED_SHORT_4_4_4_4, 0),
     ORU_ROW(UNSIGNED_SHORT_4_4_4_4_REV, 0),
     ORU_ROW(UNSIGNED_SHORT_5_5_5_1, 0),
     ORU_ROW(UNSIGNED_SHORT_1_5_5_5_REV, 0),
     ORU_ROW(UNSIGNED_INT_8_8_8_8, 0),
     ORU_ROW(UNSIGNED_INT_8_8_8_8_REV, 0),
     ORU_ROW(UNSIGNED_INT_10_10_10_2, 0),
     ORU_ROW(UNSIGNED_INT_2_10_10_10_REV, 0),
     ORU_ROW(HALF_FLOAT, 2)}};
#undef ORU_ROW
static_assert(kTypes.isInOrder());

#define ORU_ROW(Name)                                                                              \
    { Texture::FILTER_##Name, GL_##Name }
constexpr internal::Translation<Texture::Filter, 6> kFilters = {
    ORU_TRANSLATION_FAILURE("Filter enums are not all properly translated."),
    {ORU_ROW(NEAREST), ORU_ROW(LINEAR), ORU_ROW(NEAREST_MIPMAP_NEAREST),
     ORU_ROW(LINEAR_MIPMAP_NEAREST), ORU_ROW(NEAREST_MIPMAP_LINEAR),
     ORU_ROW(LINEAR_MIPMAP_LINEAR)}};
#undef ORU_ROW
static_assert(kFilters.isInOrder());

#define ORU_ROW(Name)                                                                              \
    { Texture::WRAPMODE_##Name, GL_##Name }
constexpr internal::Translation<Texture::WrapMode, 5> kWrapModes = {
    ORU_TRANSLATION_FAILURE("WrapMode enums are not all properly translated."),
    {ORU_ROW(CLAMP), ORU_ROW(CLAMP_TO_BORDER), ORU_ROW(CLAMP_TO_EDGE), ORU_ROW(MIRRORED_REPEAT),
     ORU_ROW(REPEAT)}};
#undef ORU_ROW
static_assert(kWrapModes.isInOrder());

#define ORU_ROW(Name)                                                                              \
    { Texture::PIXELSTOREMODE_##Name, GL_##Name }
constexpr internal::Translation<Texture::PixelStoreMode, 16> kPixelStoreModes = {
    ORU_TRANSLATION_FAILURE("PixelStoreMode enums are not all properly translated."),
    {ORU_ROW(PACK_SWAP_BYTES), ORU_ROW(PACK_LSB_FIRST), ORU_ROW(PACK_ROW_LENGTH),
     ORU_ROW(PACK_IMAGE_HEIGHT), ORU_ROW(PACK_SKIP_PIXELS), ORU_ROW(PACK_SKIP_ROWS),
     ORU_ROW(PACK_SKIP_IMAGES), ORU_ROW(PACK_ALIGNMENT), ORU_ROW(UNPACK_SWAP_BYTES),
     ORU_ROW(UNPACK_LSB_FIRST), ORU_ROW(UNPACK_ROW_LENGTH), ORU_ROW(UNPACK_IMAGE_HEIGHT),
     ORU_ROW(UNPACK_SKIP_PIXELS), ORU_ROW(UNPACK_SKIP_ROWS), ORU_ROW(UNPACK_SKIP_IMAGES),
     ORU_ROW(UNPACK_ALIGNMENT)}};
#undef ORU_ROW
static_assert(kPixelStoreModes.isInOrder());

/// A size halved `level` times.
std::uint64_t AtLevel(std::uint64_t size, unsigned int level) {
    return level < 64 ? size >> level : 0;
}

} // namespace

Texture::Texture(Target target, TargetBinding binding, InternalFormat format, std::uint64_t width,
                 std::uint64_t height, std::uint64_t depth)
    : Object(Target2GL(target), TargetBinding2GL(binding)), format_(format), width_(width),
      height_(height), depth_(depth) {
    ORU_GL(GenTextures, 1, &objectID_);
    if (objectID_ == 0)
        ORU_THROW_INTERNAL("Texture:: contructor failed to allocate new GPU texture resource");
}

Texture::~Texture() {
    internal::Release([this] { ORU_GL(DeleteTextures, 1, &objectID_); });
}

std::uint64_t Texture::width(unsigned int level) const {
    return AtLevel(width_, level);
}

std::uint64_t Texture::height(unsigned int level) const {
    return AtLevel(height_, level);
}

std::uint64_t Texture::depth(unsigned int level) const {
    return AtLevel(depth_, level);
}

int Texture::sizeInBytes() const {
    if (sizeInBytes_ == ~std::uint64_t(0))
        sizeInBytes_ = SizeInBytes(format_, width_, height_, depth_);
    return static_cast<int>(sizeInBytes_);
}

unsigned int Texture::getGLFormat(InternalFormat format) const {
    if (format < INTERNALFORMAT_RED || format >= INTERNALFORMAT_RGB)
        return GL_BGRA;
    return format < INTERNALFORMAT_RG ? GL_RED : GL_RG;
}

void Texture::setFilter(Filter minification, Filter magnification) {
    ORU_GL(TexParameteri, target(), GL_TEXTURE_MIN_FILTER,
           static_cast<GLint>(Filter2GL(minification)));
    ORU_GL(TexParameteri, target(), GL_TEXTURE_MAG_FILTER,
           static_cast<GLint>(Filter2GL(magnification)));
}

void Texture::setBorderColor(float const *rgba) {
    ORU_GL(TexParameterfv, target(), GL_TEXTURE_BORDER_COLOR, rgba);
}

void Texture::enableAutoMIPGeneration(bool on) {
    ORU_GL(TexParameteri, target(), GL_GENERATE_MIPMAP, on ? 1 : 0);
}

std::size_t Texture::Channels(InternalFormat format) {
    InternalFormatRow const *const row = kInternalFormats.find(format);
    if (!row || row->channels == 0)
        ORU_THROW_INTERNAL("InternalFormat enums are not all properly sized.");
    return row->channels;
}

std::size_t Texture::Channels(Format format) {
    FormatRow const *const row = kFormats.find(format);
    if (!row)
        ORU_THROW_INTERNAL("InternalFormat enums are not all properly sized.");
    return row->channels;
}

std::size_t Texture::SizeInBytes(InternalFormat format, std::uint64_t width, std::uint64_t height,
                                 std::uint64_t depth) {
    std::size_t const channels = Channels(format);
    InternalFormatRow const &row = *kInternalFormats.find(format);
    if (row.bytes == 0)
        ORU_THROW_INTERNAL(ComposeText("Texture::SizeInBytes Unknown color channels for format ",
                                       ORUOGLTokenName(row.gl)));
    return channels * row.bytes * width * height * depth;
}

std::size_t Texture::BytesPerPixel(Format format, Type type) {
    std::size_t const channels = Channels(format);
    TypeRow const *const row = kTypes.find(type);
    if (!row || row->bytes == 0)
        ORU_THROW_INTERNAL(ComposeText("pixelDataSize: Unknown type ",
                                       row ? ORUOGLTokenName(row->gl) : "Unknown Token"));
    return channels * row->bytes;
}

bool Texture::IsTargetSupported(unsigned int target) {
    switch (target) {
    case GL_TEXTURE_1D:
    case GL_TEXTURE_2D:
    case GL_TEXTURE_3D:
        return true;
    case GL_TEXTURE_RECTANGLE:
        return internal::Supports(GL_ARB_TEXTURE_RECTANGLE);
    case GL_TEXTURE_1D_ARRAY:
    case GL_TEXTURE_2D_ARRAY:
        return internal::Supports(GL_EXT_TEXTURE_ARRAY);
    default:
        return false;
    }
}

bool Texture::SupportsAutoMIPGeneration() {
    ExtensionManager const *const record = ExtensionManager::Instance();
    if (!record)
        return false;
    unsigned int const major = record->majorVersion();
    return major > 1 || (major == 1 && record->minorVersion() >= 4);
}

void Texture::PushAndSetReadbackByteAlignment(unsigned int bytes) {
    internal::CheckByteAlignment(bytes);
    ORU_GL(PushClientAttrib, GL_CLIENT_PIXEL_STORE_BIT);
    ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, static_cast<GLint>(bytes));
}

void Texture::PushAndSetTransferByteAlignment(unsigned int bytes) {
    internal::CheckByteAlignment(bytes);
    ORU_GL(PushClientAttrib, GL_CLIENT_PIXEL_STORE_BIT);
    ORU_GL(PixelStorei, GL_UNPACK_ALIGNMENT, static_cast<GLint>(bytes));
}

void Texture::PopPixelTransferModes() {
    ORU_GL0(PopClientAttrib);
}

unsigned int Texture::Target2GL(Target target) {
    return kTargets.toGL(target);
}

Texture::Target Texture::GL2Target(unsigned int target) {
    return kTargets.fromGL(target);
}

unsigned int Texture::TargetBinding2GL(TargetBinding binding) {
    return kTargetBindings.toGL(binding);
}

Texture::TargetBinding Texture::GL2TargetBinding(unsigned int binding) {
    return kTargetBindings.fromGL(binding);
}

unsigned int Texture::InternalFormat2GL(InternalFormat format) {
    return kInternalFormats.toGL(format);
}

Texture::InternalFormat Texture::GL2InternalFormat(unsigned int format) {
    return kInternalFormats.fromGL(format);
}

unsigned int Texture::Format2GL(Format format) {
    return kFormats.toGL(format);
}

Texture::Format Texture::GL2Format(unsigned int format) {
    return kFormats.fromGL(format);
}

unsigned int Texture::Type2GL(Type type) {
    return kTypes.toGL(type);
}

Texture::Type Texture::GL2Type(unsigned int type) {
    return kTypes.fromGL(type);
}

unsigned int Texture::Filter2GL(Filter filter) {
    return kFilters.toGL(filter);
}

Texture::Filter Texture::GL2Filter(unsigned int filter) {
    return kFilters.fromGL(filter);
}

unsigned int Texture::WrapMode2GL(WrapMode mode) {
    return kWrapModes.toGL(mode);
}

Texture::WrapMode Texture::GL2WrapMode(unsigned int mode) {
    return kWrapModes.fromGL(mode);
}

unsigned int Texture::PixelStoreMode2GL(PixelStoreMode mode) {
    return kPixelStoreModes.toGL(mode);
}

Texture::PixelStoreMode Texture::GL2PixelStoreMode(unsigned int mode) {
    return kPixelStoreModes.fromGL(mode);
}

std::ostream &operator<<(std::ostream &os, Texture::InternalFormat format) {
    InternalFormatRow const *const row = kInternalFormats.find(format);
    return os << (row ? row->name : "UNKNOWN FORMAT");
}

} // namespace ORU::OGL
