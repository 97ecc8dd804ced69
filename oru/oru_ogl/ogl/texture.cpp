// What all textures have in common.
#include "oru/oru_ogl/ogl/texture.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"
#include "oru/oru_ogl/ogl/internal/textures/laterformats.h"
#include "oru/oru_ogl/ogl/internal/textures/texturetables.h"
#include "oru/oru_ogl/ogl/pixelview.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <ostream>
#include <utility>

namespace ORU::OGL {

namespace {

constexpr std::uint64_t kNotComputed = ~std::uint64_t(0) >> 1;

/// A size halved `level` times.
std::uint64_t AtLevel(std::uint64_t size, unsigned int level) {
    return level < 64 ? size >> level : 0;
}

/// A side of a level that is there.
std::uint64_t AtLeastOne(std::uint64_t size) {
    return std::max<std::uint64_t>(size, 1);
}

/// The format of a texture that was made elsewhere.
Texture::InternalFormat FormatOf(GLenum gl) {
    // What RED and RG make, by the name that OpenGL gives it.
    if (gl == GL_R8)
        return Texture::INTERNALFORMAT_RED;
    if (gl == GL_RG8)
        return Texture::INTERNALFORMAT_RG;
    // Names without a size, as they stand in many a call of other code.
    if (gl == GL_DEPTH_STENCIL)
        return Texture::INTERNALFORMAT_DEPTH24_STENCIL8;
    if (gl == GL_SRGB)
        return Texture::INTERNALFORMAT_SRGB8;
    if (gl == GL_SRGB_ALPHA)
        return Texture::INTERNALFORMAT_SRGB8_ALPHA8;
    if (auto const *const row = internal::kInternalFormats.findGL(gl))
        return row->value;
    auto const *const row = internal::kLaterFormats.findGL(gl);
    if (!row)
        ORU_THROW_INTERNAL("A texture of the format ", ORUOGLTokenName(gl),
                           " cannot be taken over: no InternalFormat stands for it");
    return row->value;
}

} // namespace

Texture::Texture(Target target, TargetBinding binding, InternalFormat format, std::uint64_t width,
                 std::uint64_t height, std::uint64_t depth)
    : Object(Target2GL(target), TargetBinding2GL(binding)), format_(format), width_(width),
      height_(height), depth_(depth), sizeInBytes_(kNotComputed), generatesMipmaps_(0) {
    internal::RequireFormat(format);
    try {
        ORU_GL(GenTextures, 1, &objectID_);
    } catch (...) {
        deleteObject(); // an error that was pending before ends the call when the name is made
        throw;
    }
    if (objectID_ == 0) // the check's text is what hosts see, with its slip
        ORU_THROW_INTERNAL("Texture:: contructor failed to allocate new GPU texture resource");
}

Texture::Texture(Target target, TargetBinding binding, unsigned int name, ownership_tag ownership)
    : Object(Target2GL(target), TargetBinding2GL(binding), name, ownership), depth_(1),
      sizeInBytes_(kNotComputed), generatesMipmaps_(0) {
    internal::RequireName(ORU_GL(IsTexture, name), name, "texture");
    internal::BoundObjectScope bound(*this, ORU_BINDER(BindTexture));
    auto const ofLevel0 = [&](GLenum parameter) {
        GLint value = 0;
        ORU_GL(GetTexLevelParameteriv,
               target == TARGET_TEXTURE_CUBE_MAP ? GL_TEXTURE_CUBE_MAP_POSITIVE_X : this->target(),
               0, parameter, &value);
        return static_cast<unsigned int>(value);
    };
    width_ = ofLevel0(GL_TEXTURE_WIDTH);
    height_ = ofLevel0(GL_TEXTURE_HEIGHT);
    if (target == TARGET_TEXTURE_CUBE_MAP)
        depth_ = 6;
    else if (target == TARGET_TEXTURE_3D || target == TARGET_TEXTURE_2D_ARRAY ||
             target == TARGET_TEXTURE_CUBE_MAP_ARRAY)
        depth_ = ofLevel0(GL_TEXTURE_DEPTH);
    if (width_ == 0)
        ORU_THROW_INTERNAL("The texture ", name, " has no level 0 yet");
    GLenum internalFormat = ofLevel0(GL_TEXTURE_INTERNAL_FORMAT);
    if (internalFormat == GL_DEPTH_COMPONENT) {
        unsigned int const bits = ofLevel0(GL_TEXTURE_DEPTH_SIZE);
        internalFormat = bits <= 16   ? GL_DEPTH_COMPONENT16
                         : bits <= 24 ? GL_DEPTH_COMPONENT24
                                      : GL_DEPTH_COMPONENT32;
    }
    format_ = FormatOf(internalFormat);
    bound.restore();
}

Texture &Texture::operator=(Texture &&other) noexcept {
    if (this == &other)
        return *this;
    deleteObject();
    format_ = other.format_;
    width_ = other.width_;
    height_ = other.height_;
    depth_ = other.depth_;
    sizeInBytes_ = other.sizeInBytes_;
    generatesMipmaps_ = other.generatesMipmaps_;
    Object::operator=(std::move(other));
    return *this;
}

Texture::~Texture() {
    deleteObject();
}

void Texture::deleteObject() noexcept {
    if (ownsName())
        internal::Release([this] { ORU_GL(DeleteTextures, 1, &objectID_); });
}

std::uint64_t Texture::width(unsigned int level) const {
    requireObject();
    return AtLevel(width_, level);
}

std::uint64_t Texture::height(unsigned int level) const {
    requireObject();
    return AtLevel(height_, level);
}

std::uint64_t Texture::depth(unsigned int level) const {
    requireObject();
    return AtLevel(depth_, level);
}

int Texture::sizeInBytes() const {
    requireObject();
    if (sizeInBytes_ == kNotComputed)
        sizeInBytes_ = SizeInBytes(format_, width_, height_, depth_) & kNotComputed;
    return static_cast<int>(sizeInBytes_);
}

unsigned int Texture::getGLFormat(InternalFormat format) const {
    if (auto const *const row = internal::kLaterFormats.find(format))
        return row->clientFormat;
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
    requireObject();
    bool const isCore = internal::IsCoreContext();
    generatesMipmaps_ = isCore && on;
    if (!isCore)
        ORU_GL(TexParameteri, target(), GL_GENERATE_MIPMAP, on ? 1 : 0);
}

void Texture::generateMipmap() {
    if (internal::Supports(GL_ARB_FRAMEBUFFER_OBJECT))
        ORU_GL(GenerateMipmap, target());
    else if (internal::Supports(GL_EXT_FRAMEBUFFER_OBJECT))
        ORU_GL(GenerateMipmapEXT, target());
    else
        ORU_THROW_INTERNAL("Texture::generateMipmap needs OpenGL 3.0, GL_ARB_framebuffer_object or "
                           "GL_EXT_framebuffer_object: upload each level");
}

void Texture::setSwizzle(Swizzle red, Swizzle green, Swizzle blue, Swizzle alpha) {
    ORU_ASSERT_SUPPORTED(GL_ARB_TEXTURE_SWIZZLE);
    GLint channels[4] = {};
    Swizzle const sources[] = {red, green, blue, alpha};
    for (int i = 0; i < 4; ++i)
        channels[i] = static_cast<GLint>(Swizzle2GL(sources[i]));
    ORU_GL(TexParameteriv, target(), GL_TEXTURE_SWIZZLE_RGBA, channels);
}

void Texture::setMaxAnisotropy(float ratio) {
    internal::RequireAnisotropy(ratio);
    ORU_GL(TexParameterf, target(), GL_TEXTURE_MAX_ANISOTROPY_EXT, ratio);
}

void Texture::setCompare(Compare compare) {
    ORU_ASSERT_SUPPORTED(GL_VERSION_1_4);
    auto const function = static_cast<GLint>(Compare2GL(compare));
    ORU_GL(TexParameteri, target(), GL_TEXTURE_COMPARE_MODE,
           compare == COMPARE_NONE ? GL_NONE : GL_COMPARE_REF_TO_TEXTURE);
    if (compare != COMPARE_NONE)
        ORU_GL(TexParameteri, target(), GL_TEXTURE_COMPARE_FUNC, function);
}

void Texture::setLevelRange(unsigned int first, unsigned int last) {
    constexpr unsigned int kMostLevels = 1000; // what OpenGL itself begins with as the last
    if (last < first || last > kMostLevels)
        ORU_THROW_INTERNAL("Levels ", first, " to ", last,
                           " are no range: the last is not before the first, and at "
                           "most ",
                           kMostLevels);
    ORU_GL(TexParameteri, target(), GL_TEXTURE_BASE_LEVEL, static_cast<GLint>(first));
    ORU_GL(TexParameteri, target(), GL_TEXTURE_MAX_LEVEL, static_cast<GLint>(last));
}

float Texture::MaxAnisotropy() {
    float most = 1;
    if (internal::Supports(GL_EXT_TEXTURE_FILTER_ANISOTROPIC))
        ORU_GL(GetFloatv, GL_MAX_TEXTURE_MAX_ANISOTROPY_EXT, &most);
    return most;
}

bool Texture::IsFormatSupported(InternalFormat format) {
    return internal::RecordOfCurrent() && internal::IsFormatSupported(format);
}

bool Texture::IsCompressed(InternalFormat format) {
    auto const *const row = internal::kLaterFormats.find(format);
    return row && row->block > 1;
}

std::size_t Texture::compressedSize(unsigned int level) const {
    return SizeInBytes(format(), AtLeastOne(width(level)), AtLeastOne(height(level)),
                       AtLeastOne(depth(level)));
}

void Texture::checkCompressed(std::uint64_t width, std::uint64_t height, std::uint64_t depth,
                              std::size_t bytes) const {
    if (!IsCompressed(format()))
        ORU_THROW_INTERNAL("A texture of ", format(),
                           " is not compressed: use subImage and getPixelData");
    std::size_t const needed = SizeInBytes(format(), width, height, depth);
    if (bytes != needed)
        ORU_THROW_INTERNAL("Blocks of ", format(), " for ", width, " x ", height, " x ", depth,
                           " texels take ", needed, " bytes, not ", bytes);
}

void Texture::checkCompressedLevel(int level, std::uint64_t depth, std::size_t bytes) const {
    if (level < 0)
        ORU_THROW_INTERNAL("a negative texture image mip-map level supplied");
    auto const at = static_cast<unsigned int>(level);
    checkCompressed(AtLeastOne(width(at)), AtLeastOne(height(at)), AtLeastOne(depth), bytes);
}

std::size_t Texture::Channels(InternalFormat format) {
    if (auto const *const row = internal::kLaterFormats.find(format))
        return row->channels;
    auto const *const row = internal::kInternalFormats.find(format);
    if (!row || row->channels == 0)
        ORU_THROW_INTERNAL("InternalFormat enums are not all properly sized.");
    return row->channels;
}

std::size_t Texture::Channels(Format format) {
    auto const *const later = internal::kLaterPixelFormats.find(format);
    auto const *const row = later ? later : internal::kFormats.find(format);
    if (!row)
        ORU_THROW_INTERNAL("InternalFormat enums are not all properly sized.");
    return row->channels;
}

std::size_t Texture::SizeInBytes(InternalFormat format, std::uint64_t width, std::uint64_t height,
                                 std::uint64_t depth) {
    if (auto const *const row = internal::kLaterFormats.find(format)) {
        auto const blocks = [row](std::uint64_t size) {
            return size / row->block + (size % row->block != 0);
        };
        return row->blockBytes * blocks(width) * blocks(height) * depth;
    }
    std::size_t const channels = Channels(format);
    auto const &row = *internal::kInternalFormats.find(format);
    if (row.bytes == 0)
        ORU_THROW_INTERNAL("Texture::SizeInBytes Unknown color channels for format ",
                           ORUOGLTokenName(row.gl));
    return channels * row.bytes * width * height * depth;
}

std::size_t Texture::BytesPerPixel(Format format, Type type) {
    std::size_t const channels = Channels(format);
    if (internal::kLaterTypes.find(type) || internal::kLaterPixelFormats.find(format))
        return static_cast<std::size_t>(PixelShape{format, type}.bytesPerPixel());
    auto const *const row = internal::kTypes.find(type);
    if (!row || row->bytes == 0)
        ORU_THROW_INTERNAL("pixelDataSize: Unknown type ",
                           row ? ORUOGLTokenName(row->gl) : "Unknown Token");
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
    ExtensionManager const *const record = internal::RecordOfCurrent();
    if (!record)
        return false;
    unsigned int const major = record->majorVersion();
    return major > 1 || (major == 1 && record->minorVersion() >= 4);
}

void Texture::PushAndSetReadbackByteAlignment(unsigned int bytes) {
    internal::CheckByteAlignment(bytes);
    internal::PushPixelStorage(internal::kPackStorage);
    ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, static_cast<GLint>(bytes));
}

void Texture::PushAndSetTransferByteAlignment(unsigned int bytes) {
    internal::CheckByteAlignment(bytes);
    internal::PushPixelStorage(internal::kUnpackStorage);
    ORU_GL(PixelStorei, GL_UNPACK_ALIGNMENT, static_cast<GLint>(bytes));
}

void Texture::PopPixelTransferModes() {
    internal::PopPixelStorage();
}

ORU_TRANSLATED_IN_TWO(Texture, Target, internal::kTargets, internal::kLaterTargets)
ORU_TRANSLATED_IN_TWO(Texture, TargetBinding, internal::kTargetBindings,
                      internal::kLaterTargetBindings)
ORU_TRANSLATED_IN_TWO(Texture, InternalFormat, internal::kInternalFormats, internal::kLaterFormats)
ORU_TRANSLATED_IN_TWO(Texture, Format, internal::kFormats, internal::kLaterPixelFormats)
ORU_TRANSLATED_IN_TWO(Texture, Type, internal::kTypes, internal::kLaterTypes)
ORU_TRANSLATED(Texture, Filter, internal::kFilters)
ORU_TRANSLATED(Texture, WrapMode, internal::kWrapModes)
ORU_TRANSLATED(Texture, PixelStoreMode, internal::kPixelStoreModes)
ORU_TRANSLATED(Texture, Swizzle, internal::kSwizzles)
ORU_TRANSLATED(Texture, Compare, internal::kCompares)

std::ostream &operator<<(std::ostream &os, Texture::InternalFormat format) {
    if (auto const *const later = internal::kLaterFormats.find(format))
        return os << later->name;
    auto const *const row = internal::kInternalFormats.find(format);
    return os << (row ? row->name : "UNKNOWN FORMAT");
}

} // namespace ORU::OGL
