// What the image transfers of all textures share: checks, bindings and client state.
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/internal/textures/texturetables.h"

#include <cstring>

namespace ORU::OGL::internal {

void ThrowPart(char const *operation, int level, std::initializer_list<Side> sides) {
    for (Side const &side : sides) {
        if (side.size == 0)
            ORU_THROW_INTERNAL(
                ComposeText("error ", operation, " ", side.padded, " of zero supplied"));
    }
    if (level < 0)
        ORU_THROW_INTERNAL("a negative texture image mip-map level supplied");
    for (Side const &side : sides) {
        if (side.size > side.limit)
            ORU_THROW_INTERNAL(ComposeText(side.name, "(", side.size, ") is greater than ",
                                           side.padded, " of image (", side.limit, ") "));
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
        ORU_THROW_INTERNAL(ComposeText(
            "offset(", offset, ") is greater than pixel buffer object size", buffer->size()));
    CheckBuffer(buffer);
}

void CheckByteAlignment(unsigned int bytes) {
    if (bytes != 1 && bytes != 2 && bytes != 4 && bytes != 8)
        ORU_THROW_INTERNAL("Invalid row byte alignment (must be of 1, 2, 4, or 8).");
}

void RequireFormat(Texture::InternalFormat format) {
    auto const *const row = kInternalFormats.find(format);
    // The formats of core contexts are those that begin with red.
    bool const isDeprecated = row && row->name[std::strlen("INTERNALFORMAT_")] != 'R';
    if (isDeprecated && IsCoreContext())
        ORU_THROW_INTERNAL(ComposeText(row->name,
                                       " needs a compatibility context: in a core one use "
                                       "a format of red, or of red and green"));
}

PixelLayout LayoutOf(Texture::Format format, Texture::Type type) {
    PixelLayout const layout = {Texture::Format2GL(format), Texture::Type2GL(type)};
    bool const isDeprecated =
        format == Texture::FORMAT_COLOR_INDEX || format == Texture::FORMAT_ALPHA ||
        format == Texture::FORMAT_LUMINANCE || format == Texture::FORMAT_LUMINANCE_ALPHA ||
        type == Texture::TYPE_BITMAP;
    if (isDeprecated && IsCoreContext())
        ORU_THROW_INTERNAL(ComposeText(
            "Pixels of ", ORUOGLTokenName(layout.format), " and ", ORUOGLTokenName(layout.type),
            " need a compatibility context: in a core one use FORMAT_RED or FORMAT_RG"));
    return layout;
}

} // namespace ORU::OGL::internal
