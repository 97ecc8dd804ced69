// What the image transfers of all textures share: checks, bindings and client state.
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/textures/laterformats.h"

#include <algorithm>
#include <cstring>

namespace ORU::OGL::internal {

void ThrowPart(char const *operation, int level, std::initializer_list<Side> sides) {
    for (Side const &side : sides) {
        if (side.size == 0)
            ORU_THROW_INTERNAL("error ", operation, " ", side.padded, " of zero supplied");
    }
    if (level < 0)
        ORU_THROW_INTERNAL("a negative texture image mip-map level supplied");
    for (Side const &side : sides) {
        if (side.size > side.limit)
            ORU_THROW_INTERNAL(side.name, "(", side.size, ") is greater than ", side.padded,
                               " of image (", side.limit, ") ");
    }
    ORU_ASSERT(!"A part that breaks no rule.");
}

void CheckBuffer(Buffer const *buffer) {
    ORU_ENFORCE_TEXT("buffer != NULL", buffer);
    if (buffer->isMapped())
        ORU_THROW_INTERNAL("Pixel Buffer Object cannot be memory mapped during data transfer");
}

void CheckUnpackBuffer(Buffer const *buffer, std::uint64_t offset) {
    ORU_ENFORCE_TEXT("buffer != NULL", buffer);
    if (offset >= buffer->size())
        ORU_THROW_INTERNAL("offset(", offset, ") is greater than pixel buffer object size",
                           buffer->size());
    CheckBuffer(buffer);
}

void CheckByteAlignment(unsigned int bytes) {
    if (bytes != 1 && bytes != 2 && bytes != 4 && bytes != 8)
        ORU_THROW_INTERNAL("Invalid row byte alignment (must be of 1, 2, 4, or 8).");
}

namespace {

/// Of the formats of OpenGL 2, those of core contexts are the ones that begin with red.
bool IsDeprecated(Texture::InternalFormat format) {
    auto const *const row = kInternalFormats.find(format);
    return row && row->name[std::strlen("INTERNALFORMAT_")] != 'R';
}

char const *NameOf(TexelKind kind) {
    return kind == TexelKind::Integer ? "integers" : kind == TexelKind::Depth ? "depth" : "colours";
}

/// The version of a record, 30 for 3.0. Records count all from 4.1 on as 4.1, and the shading
/// language, numbered alike there, tells them apart.
unsigned int VersionOf(ExtensionManager const &record) {
    unsigned int const version = record.majorVersion() * 10 + record.minorVersion();
    return version < 41 ? version : record.glslMajorVersion() * 10 + record.glslMinorVersion() / 10;
}

} // namespace

bool IsFormatSupported(Texture::InternalFormat format) {
    if (IsDeprecated(format))
        return !IsCoreContext();
    auto const *const row = kLaterFormats.find(format);
    if (!row)
        return kInternalFormats.find(format) != nullptr;
    ExtensionManager const &record = *RecordOfCurrent();
    if (row->version && VersionOf(record) >= row->version)
        return true;
    auto const &names = record.supportedExtensionNames();
    return row->extension && std::find(names.begin(), names.end(), row->extension) != names.end();
}

void RequireFormat(Texture::InternalFormat format) {
    if (auto const *const row = kLaterFormats.find(format)) {
        if (RecordOfCurrent() && !IsFormatSupported(format))
            ORU_THROW_INTERNAL("The current context has no textures of ", row->name,
                               ": ask Texture::IsFormatSupported first");
        return;
    }
    if (IsDeprecated(format) && IsCoreContext())
        ORU_THROW_INTERNAL(format, " needs a compatibility context: in a core one use "
                                   "a format of red, or of red and green");
}

void RequireAnisotropy(float ratio) {
    ORU_ASSERT_SUPPORTED(GL_EXT_TEXTURE_FILTER_ANISOTROPIC);
    float const most = Texture::MaxAnisotropy();
    if (!(ratio >= 1 && ratio <= most))
        ORU_THROW_INTERNAL("An anisotropy of ", ratio, " is not from 1 to ", most);
}

void CheckSameKind(Texture::InternalFormat format, Texture::Format pixels) {
    auto const *const row = kLaterFormats.find(format);
    TexelKind const texels = row ? KindOf(row->clientFormat) : TexelKind::Colour;
    unsigned int const glFormat = Texture::Format2GL(pixels);
    TexelKind const memory = KindOf(glFormat);
    if (texels != memory)
        ORU_THROW_INTERNAL("A texture of ", format, " holds ", NameOf(texels), ", and pixels of ",
                           ORUOGLTokenName(glFormat), " are ", NameOf(memory),
                           ": transfer it in a format of its kind");
}

GLenum StorageType(Texture::InternalFormat format) {
    auto const *const row = kLaterFormats.find(format);
    return row ? row->clientType : GL_UNSIGNED_BYTE;
}

PixelLayout LayoutOf(Texture::Format format, Texture::Type type) {
    PixelLayout const layout = {Texture::Format2GL(format), Texture::Type2GL(type)};
    bool const isDeprecated =
        format == Texture::FORMAT_COLOR_INDEX || format == Texture::FORMAT_ALPHA ||
        format == Texture::FORMAT_LUMINANCE || format == Texture::FORMAT_LUMINANCE_ALPHA ||
        type == Texture::TYPE_BITMAP;
    if (isDeprecated && IsCoreContext())
        ORU_THROW_INTERNAL(
            "Pixels of ", ORUOGLTokenName(layout.format), " and ", ORUOGLTokenName(layout.type),
            " need a compatibility context: in a core one use FORMAT_RED or FORMAT_RG");
    return layout;
}

} // namespace ORU::OGL::internal
