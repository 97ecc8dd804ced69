// The later formats of textures and of pixels in memory, and what is known of each.
#pragma once

#include "oru/oru_ogl/ogl/internal/textures/texturetables.h"

namespace ORU::OGL::internal {

/// The value of the first enumerator of each of these tables.
inline constexpr std::size_t kFirstLater = 256;

struct LaterFormatRow {
    Texture::InternalFormat value;
    unsigned int gl;
    char const *name;
    unsigned int channels;
    unsigned int clientFormat; ///< pixels in memory of the same channels
    unsigned int clientType;
    unsigned int block;      ///< texels along a side of a block: 4 of a compressed one, or 1
    unsigned int blockBytes; ///< of a block
    unsigned int version;    ///< of OpenGL that has it, 30 for 3.0; 0 for none
    char const *extension;   ///< that has it before, or null
};

#define ORU_ROW(Name, Channels, ClientFormat, ClientType, Block, Bytes, Version, Extension)        \
    {                                                                                              \
        Texture::INTERNALFORMAT_##Name, GL_##Name, "INTERNALFORMAT_" #Name, Channels,              \
            GL_##ClientFormat, GL_##ClientType, Block, Bytes, Version, Extension                   \
    }
// clang-format off
inline constexpr Translation<Texture::InternalFormat, 52, LaterFormatRow> kLaterFormats = {
    nullptr, {
        ORU_ROW(R8, 1, RED, UNSIGNED_BYTE, 1, 1, 30, "GL_ARB_texture_rg"),
        ORU_ROW(RG8, 2, RG, UNSIGNED_BYTE, 1, 2, 30, "GL_ARB_texture_rg"),
        ORU_ROW(R11F_G11F_B10F, 3, RGB, UNSIGNED_INT_10F_11F_11F_REV, 1, 4, 30, "GL_EXT_packed_float"),
        ORU_ROW(SRGB8, 3, RGB, UNSIGNED_BYTE, 1, 3, 21, "GL_EXT_texture_sRGB"),
        ORU_ROW(SRGB8_ALPHA8, 4, RGBA, UNSIGNED_BYTE, 1, 4, 21, "GL_EXT_texture_sRGB"),
        ORU_ROW(DEPTH_COMPONENT16, 1, DEPTH_COMPONENT, UNSIGNED_SHORT, 1, 2, 14, "GL_ARB_depth_texture"),
        ORU_ROW(DEPTH_COMPONENT24, 1, DEPTH_COMPONENT, UNSIGNED_INT, 1, 4, 14, "GL_ARB_depth_texture"),
        ORU_ROW(DEPTH_COMPONENT32, 1, DEPTH_COMPONENT, UNSIGNED_INT, 1, 4, 14, "GL_ARB_depth_texture"),
        ORU_ROW(DEPTH_COMPONENT32F, 1, DEPTH_COMPONENT, FLOAT, 1, 4, 30, "GL_ARB_depth_buffer_float"),
        ORU_ROW(DEPTH24_STENCIL8, 2, DEPTH_STENCIL, UNSIGNED_INT_24_8, 1, 4, 30, "GL_EXT_packed_depth_stencil"),
        ORU_ROW(DEPTH32F_STENCIL8, 2, DEPTH_STENCIL, FLOAT_32_UNSIGNED_INT_24_8_REV, 1, 8, 30, "GL_ARB_depth_buffer_float"),
        ORU_ROW(R8I, 1, RED_INTEGER, BYTE, 1, 1, 30, nullptr),
        ORU_ROW(R8UI, 1, RED_INTEGER, UNSIGNED_BYTE, 1, 1, 30, nullptr),
        ORU_ROW(R16I, 1, RED_INTEGER, SHORT, 1, 2, 30, nullptr),
        ORU_ROW(R16UI, 1, RED_INTEGER, UNSIGNED_SHORT, 1, 2, 30, nullptr),
        ORU_ROW(R32I, 1, RED_INTEGER, INT, 1, 4, 30, nullptr),
        ORU_ROW(R32UI, 1, RED_INTEGER, UNSIGNED_INT, 1, 4, 30, nullptr),
        ORU_ROW(RG8I, 2, RG_INTEGER, BYTE, 1, 2, 30, nullptr),
        ORU_ROW(RG8UI, 2, RG_INTEGER, UNSIGNED_BYTE, 1, 2, 30, nullptr),
        ORU_ROW(RG16I, 2, RG_INTEGER, SHORT, 1, 4, 30, nullptr),
        ORU_ROW(RG16UI, 2, RG_INTEGER, UNSIGNED_SHORT, 1, 4, 30, nullptr),
        ORU_ROW(RG32I, 2, RG_INTEGER, INT, 1, 8, 30, nullptr),
        ORU_ROW(RG32UI, 2, RG_INTEGER, UNSIGNED_INT, 1, 8, 30, nullptr),
        ORU_ROW(RGB8I, 3, RGB_INTEGER, BYTE, 1, 3, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGB8UI, 3, RGB_INTEGER, UNSIGNED_BYTE, 1, 3, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGB16I, 3, RGB_INTEGER, SHORT, 1, 6, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGB16UI, 3, RGB_INTEGER, UNSIGNED_SHORT, 1, 6, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGB32I, 3, RGB_INTEGER, INT, 1, 12, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGB32UI, 3, RGB_INTEGER, UNSIGNED_INT, 1, 12, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGBA8I, 4, RGBA_INTEGER, BYTE, 1, 4, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGBA8UI, 4, RGBA_INTEGER, UNSIGNED_BYTE, 1, 4, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGBA16I, 4, RGBA_INTEGER, SHORT, 1, 8, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGBA16UI, 4, RGBA_INTEGER, UNSIGNED_SHORT, 1, 8, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGBA32I, 4, RGBA_INTEGER, INT, 1, 16, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGBA32UI, 4, RGBA_INTEGER, UNSIGNED_INT, 1, 16, 30, "GL_EXT_texture_integer"),
        ORU_ROW(RGB10_A2UI, 4, RGBA_INTEGER, UNSIGNED_INT_2_10_10_10_REV, 1, 4, 33, "GL_ARB_texture_rgb10_a2ui"),
        ORU_ROW(COMPRESSED_RGB_S3TC_DXT1_EXT, 3, RGB, UNSIGNED_BYTE, 4, 8, 0, "GL_EXT_texture_compression_s3tc"),
        ORU_ROW(COMPRESSED_RGBA_S3TC_DXT1_EXT, 4, RGBA, UNSIGNED_BYTE, 4, 8, 0, "GL_EXT_texture_compression_s3tc"),
        ORU_ROW(COMPRESSED_RGBA_S3TC_DXT3_EXT, 4, RGBA, UNSIGNED_BYTE, 4, 16, 0, "GL_EXT_texture_compression_s3tc"),
        ORU_ROW(COMPRESSED_RGBA_S3TC_DXT5_EXT, 4, RGBA, UNSIGNED_BYTE, 4, 16, 0, "GL_EXT_texture_compression_s3tc"),
        ORU_ROW(COMPRESSED_SRGB_S3TC_DXT1_EXT, 3, RGB, UNSIGNED_BYTE, 4, 8, 0, "GL_EXT_texture_sRGB"),
        ORU_ROW(COMPRESSED_SRGB_ALPHA_S3TC_DXT1_EXT, 4, RGBA, UNSIGNED_BYTE, 4, 8, 0, "GL_EXT_texture_sRGB"),
        ORU_ROW(COMPRESSED_SRGB_ALPHA_S3TC_DXT3_EXT, 4, RGBA, UNSIGNED_BYTE, 4, 16, 0, "GL_EXT_texture_sRGB"),
        ORU_ROW(COMPRESSED_SRGB_ALPHA_S3TC_DXT5_EXT, 4, RGBA, UNSIGNED_BYTE, 4, 16, 0, "GL_EXT_texture_sRGB"),
        ORU_ROW(COMPRESSED_RED_RGTC1, 1, RED, UNSIGNED_BYTE, 4, 8, 30, "GL_ARB_texture_compression_rgtc"),
        ORU_ROW(COMPRESSED_SIGNED_RED_RGTC1, 1, RED, UNSIGNED_BYTE, 4, 8, 30, "GL_ARB_texture_compression_rgtc"),
        ORU_ROW(COMPRESSED_RG_RGTC2, 2, RG, UNSIGNED_BYTE, 4, 16, 30, "GL_ARB_texture_compression_rgtc"),
        ORU_ROW(COMPRESSED_SIGNED_RG_RGTC2, 2, RG, UNSIGNED_BYTE, 4, 16, 30, "GL_ARB_texture_compression_rgtc"),
        ORU_ROW(COMPRESSED_RGBA_BPTC_UNORM, 4, RGBA, UNSIGNED_BYTE, 4, 16, 42, "GL_ARB_texture_compression_bptc"),
        ORU_ROW(COMPRESSED_SRGB_ALPHA_BPTC_UNORM, 4, RGBA, UNSIGNED_BYTE, 4, 16, 42, "GL_ARB_texture_compression_bptc"),
        ORU_ROW(COMPRESSED_RGB_BPTC_SIGNED_FLOAT, 3, RGB, FLOAT, 4, 16, 42, "GL_ARB_texture_compression_bptc"),
        ORU_ROW(COMPRESSED_RGB_BPTC_UNSIGNED_FLOAT, 3, RGB, FLOAT, 4, 16, 42, "GL_ARB_texture_compression_bptc"),
    }, kFirstLater};
// clang-format on
#undef ORU_ROW

#define ORU_ROW(Name, Channels)                                                                    \
    { Texture::FORMAT_##Name, GL_##Name, Channels }
inline constexpr Translation<Texture::Format, 9, FormatRow> kLaterPixelFormats = {
    nullptr,
    {ORU_ROW(RED_INTEGER, 1), ORU_ROW(RG_INTEGER, 2), ORU_ROW(RGB_INTEGER, 3),
     ORU_ROW(BGR_INTEGER, 3), ORU_ROW(RGBA_INTEGER, 4), ORU_ROW(BGRA_INTEGER, 4),
     ORU_ROW(DEPTH_COMPONENT, 1), ORU_ROW(STENCIL_INDEX, 1), ORU_ROW(DEPTH_STENCIL, 2)},
    kFirstLater};
#undef ORU_ROW

#define ORU_ROW(Name)                                                                              \
    { Texture::TYPE_##Name, GL_##Name }
inline constexpr Translation<Texture::Type, 3> kLaterTypes = {
    nullptr,
    {ORU_ROW(UNSIGNED_INT_24_8), ORU_ROW(FLOAT_32_UNSIGNED_INT_24_8_REV),
     ORU_ROW(UNSIGNED_INT_10F_11F_11F_REV)},
    kFirstLater};
#undef ORU_ROW

#define ORU_ROW(Name)                                                                              \
    { Texture::TARGET_##Name, GL_##Name }
inline constexpr Translation<Texture::Target, 4> kLaterTargets = {
    nullptr,
    {ORU_ROW(TEXTURE_CUBE_MAP), ORU_ROW(TEXTURE_CUBE_MAP_ARRAY), ORU_ROW(TEXTURE_BUFFER),
     ORU_ROW(TEXTURE_2D_MULTISAMPLE)},
    kFirstLater};
#undef ORU_ROW

#define ORU_ROW(Name)                                                                              \
    { Texture::TARGETBINDING_##Name, GL_##Name }
inline constexpr Translation<Texture::TargetBinding, 4> kLaterTargetBindings = {
    nullptr,
    {ORU_ROW(TEXTURE_BINDING_CUBE_MAP), ORU_ROW(TEXTURE_BINDING_CUBE_MAP_ARRAY),
     ORU_ROW(TEXTURE_BINDING_BUFFER), ORU_ROW(TEXTURE_BINDING_2D_MULTISAMPLE)},
    kFirstLater};
#undef ORU_ROW

#define ORU_ROW(Name)                                                                              \
    { Texture::SWIZZLE_##Name, GL_##Name }
inline constexpr Translation<Texture::Swizzle, 6> kSwizzles = {
    ORU_TRANSLATION_FAILURE("Swizzle enums are not all properly translated."),
    {ORU_ROW(RED), ORU_ROW(GREEN), ORU_ROW(BLUE), ORU_ROW(ALPHA), ORU_ROW(ZERO), ORU_ROW(ONE)}};
#undef ORU_ROW

#define ORU_ROW(Name)                                                                              \
    { Texture::COMPARE_##Name, GL_##Name }
inline constexpr Translation<Texture::Compare, 9> kCompares = {
    ORU_TRANSLATION_FAILURE("Compare enums are not all properly translated."),
    {ORU_ROW(NONE), ORU_ROW(NEVER), ORU_ROW(LESS), ORU_ROW(EQUAL), ORU_ROW(LEQUAL),
     ORU_ROW(GREATER), ORU_ROW(NOTEQUAL), ORU_ROW(GEQUAL), ORU_ROW(ALWAYS)}};
#undef ORU_ROW

/// How texels of a format are made: transfers between the kinds are refused by OpenGL.
enum class TexelKind { Colour, Integer, Depth };

/// The kind of pixels in memory.
constexpr TexelKind KindOf(unsigned int glFormat) {
    switch (glFormat) {
    case GL_DEPTH_COMPONENT:
    case GL_STENCIL_INDEX:
    case GL_DEPTH_STENCIL:
        return TexelKind::Depth;
    case GL_RED_INTEGER:
    case GL_RG_INTEGER:
    case GL_RGB_INTEGER:
    case GL_BGR_INTEGER:
    case GL_RGBA_INTEGER:
    case GL_BGRA_INTEGER:
        return TexelKind::Integer;
    default:
        return TexelKind::Colour;
    }
}

} // namespace ORU::OGL::internal
