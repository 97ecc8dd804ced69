// The enumerations of textures with their GL values, and what is known of each value.
#pragma once

#include "oru/oru_ogl/ogl/internal/objects/translation.h"
#include "oru/oru_ogl/ogl/texture.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL::internal {

#define ORU_ROW(Name)                                                                              \
    { Texture::TARGET_##Name, GL_##Name }
inline constexpr Translation<Texture::Target, 6> kTargets = {
    ORU_TRANSLATION_FAILURE("Target enums are not all properly translated."),
    {ORU_ROW(TEXTURE_1D), ORU_ROW(TEXTURE_2D), ORU_ROW(TEXTURE_3D), ORU_ROW(TEXTURE_1D_ARRAY),
     ORU_ROW(TEXTURE_2D_ARRAY), ORU_ROW(TEXTURE_RECTANGLE)}};
#undef ORU_ROW

#define ORU_ROW(Name)                                                                              \
    { Texture::TARGETBINDING_##Name, GL_##Name }
inline constexpr Translation<Texture::TargetBinding, 6> kTargetBindings = {
    ORU_TRANSLATION_FAILURE("Target enums are not all properly translated."),
    {ORU_ROW(TEXTURE_BINDING_1D), ORU_ROW(TEXTURE_BINDING_2D), ORU_ROW(TEXTURE_BINDING_3D),
     ORU_ROW(TEXTURE_BINDING_1D_ARRAY), ORU_ROW(TEXTURE_BINDING_2D_ARRAY),
     ORU_ROW(TEXTURE_BINDING_RECTANGLE)}};
#undef ORU_ROW

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
inline constexpr Translation<Texture::InternalFormat, 58, InternalFormatRow> kInternalFormats = {
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

struct FormatRow {
    Texture::Format value;
    unsigned int gl;
    unsigned int channels;
};

#define ORU_ROW(Name, Channels)                                                                    \
    { Texture::FORMAT_##Name, GL_##Name, Channels }
inline constexpr Translation<Texture::Format, 12, FormatRow> kFormats = {
    ORU_TRANSLATION_FAILURE("Format enums are not all properly translated."),
    {ORU_ROW(COLOR_INDEX, 1), ORU_ROW(RED, 1), ORU_ROW(GREEN, 1), ORU_ROW(BLUE, 1),
     ORU_ROW(ALPHA, 1), ORU_ROW(RG, 2), ORU_ROW(RGB, 3), ORU_ROW(BGR, 3), ORU_ROW(RGBA, 4),
     ORU_ROW(BGRA, 4), ORU_ROW(LUMINANCE, 1), ORU_ROW(LUMINANCE_ALPHA, 2)}};
#undef ORU_ROW

struct TypeRow {
    Texture::Type value;
    unsigned int gl;
    unsigned int bytes; ///< of a component, 0 where transfers are not sized by it
};

#define ORU_ROW(Name, Bytes)                                                                       \
    { Texture::TYPE_##Name, GL_##Name, Bytes }
inline constexpr Translation<Texture::Type, 21, TypeRow> kTypes = {
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

#define ORU_ROW(Name)                                                                              \
    { Texture::FILTER_##Name, GL_##Name }
inline constexpr Translation<Texture::Filter, 6> kFilters = {
    ORU_TRANSLATION_FAILURE("Filter enums are not all properly translated."),
    {ORU_ROW(NEAREST), ORU_ROW(LINEAR), ORU_ROW(NEAREST_MIPMAP_NEAREST),
     ORU_ROW(LINEAR_MIPMAP_NEAREST), ORU_ROW(NEAREST_MIPMAP_LINEAR),
     ORU_ROW(LINEAR_MIPMAP_LINEAR)}};
#undef ORU_ROW

#define ORU_ROW(Name)                                                                              \
    { Texture::WRAPMODE_##Name, GL_##Name }
inline constexpr Translation<Texture::WrapMode, 5> kWrapModes = {
    ORU_TRANSLATION_FAILURE("WrapMode enums are not all properly translated."),
    {ORU_ROW(CLAMP), ORU_ROW(CLAMP_TO_BORDER), ORU_ROW(CLAMP_TO_EDGE), ORU_ROW(MIRRORED_REPEAT),
     ORU_ROW(REPEAT)}};
#undef ORU_ROW

#define ORU_ROW(Name)                                                                              \
    { Texture::PIXELSTOREMODE_##Name, GL_##Name }
inline constexpr Translation<Texture::PixelStoreMode, 16> kPixelStoreModes = {
    ORU_TRANSLATION_FAILURE("PixelStoreMode enums are not all properly translated."),
    {ORU_ROW(PACK_SWAP_BYTES), ORU_ROW(PACK_LSB_FIRST), ORU_ROW(PACK_ROW_LENGTH),
     ORU_ROW(PACK_IMAGE_HEIGHT), ORU_ROW(PACK_SKIP_PIXELS), ORU_ROW(PACK_SKIP_ROWS),
     ORU_ROW(PACK_SKIP_IMAGES), ORU_ROW(PACK_ALIGNMENT), ORU_ROW(UNPACK_SWAP_BYTES),
     ORU_ROW(UNPACK_LSB_FIRST), ORU_ROW(UNPACK_ROW_LENGTH), ORU_ROW(UNPACK_IMAGE_HEIGHT),
     ORU_ROW(UNPACK_SKIP_PIXELS), ORU_ROW(UNPACK_SKIP_ROWS), ORU_ROW(UNPACK_SKIP_IMAGES),
     ORU_ROW(UNPACK_ALIGNMENT)}};
#undef ORU_ROW

} // namespace ORU::OGL::internal
