// What all textures have in common.
#pragma once

#include "oru/oru_ogl/ogl/object.h"
#include "oru/oru_ogl/ogl/pixelunpackparameters.h"

#include <cstddef>
#include <cstdint>
#include <iosfwd>

namespace ORU::OGL {

/// A texture object with its storage; made as one of the kinds in texture1.h, texture2.h,
/// texture3.h, texturecube.h, buffertexture.h and texture2dmultisample.h.
///
/// A constructor allocates the storage (sampled with FILTER_NEAREST, clamped to its edges) and
/// leaves what was bound to the target bound. Let no pixel unpack buffer be bound meanwhile:
/// OpenGL would fill the texture from it. Setters, uploads and downloads act on the texture that is
/// bound to the target; bind first, with TextureUnit::bind.
///
/// A core context has no client attribute stack: there transfers read the pixel storage that they
/// change by glGetIntegerv and put it back by glPixelStorei, also after a failure. Formats of
/// alpha, luminance and intensity, colour indices and WRAPMODE_CLAMP need a compatibility context.
class ORU_API Texture : public Object {
public:
    /// What a texture is bound to.
    enum Target : unsigned int {
        TARGET_TEXTURE_1D = 0,    ///< GL_TEXTURE_1D
        TARGET_TEXTURE_2D,        ///< GL_TEXTURE_2D
        TARGET_TEXTURE_3D,        ///< GL_TEXTURE_3D
        TARGET_TEXTURE_1D_ARRAY,  ///< GL_TEXTURE_1D_ARRAY
        TARGET_TEXTURE_2D_ARRAY,  ///< GL_TEXTURE_2D_ARRAY
        TARGET_TEXTURE_RECTANGLE, ///< GL_TEXTURE_RECTANGLE

        TARGET_TEXTURE_CUBE_MAP = 256, ///< GL_TEXTURE_CUBE_MAP
        TARGET_TEXTURE_CUBE_MAP_ARRAY, ///< GL_TEXTURE_CUBE_MAP_ARRAY
        TARGET_TEXTURE_BUFFER,         ///< GL_TEXTURE_BUFFER
        TARGET_TEXTURE_2D_MULTISAMPLE  ///< GL_TEXTURE_2D_MULTISAMPLE
    };

    /// The query for what is bound to the target of the same value.
    enum TargetBinding : unsigned int {
        TARGETBINDING_TEXTURE_BINDING_1D = 0,    ///< GL_TEXTURE_BINDING_1D
        TARGETBINDING_TEXTURE_BINDING_2D,        ///< GL_TEXTURE_BINDING_2D
        TARGETBINDING_TEXTURE_BINDING_3D,        ///< GL_TEXTURE_BINDING_3D
        TARGETBINDING_TEXTURE_BINDING_1D_ARRAY,  ///< GL_TEXTURE_BINDING_1D_ARRAY
        TARGETBINDING_TEXTURE_BINDING_2D_ARRAY,  ///< GL_TEXTURE_BINDING_2D_ARRAY
        TARGETBINDING_TEXTURE_BINDING_RECTANGLE, ///< GL_TEXTURE_BINDING_RECTANGLE

        TARGETBINDING_TEXTURE_BINDING_CUBE_MAP = 256, ///< GL_TEXTURE_BINDING_CUBE_MAP
        TARGETBINDING_TEXTURE_BINDING_CUBE_MAP_ARRAY, ///< GL_TEXTURE_BINDING_CUBE_MAP_ARRAY
        TARGETBINDING_TEXTURE_BINDING_BUFFER,         ///< GL_TEXTURE_BINDING_BUFFER
        TARGETBINDING_TEXTURE_BINDING_2D_MULTISAMPLE  ///< GL_TEXTURE_BINDING_2D_MULTISAMPLE
    };

    /// How the implementation keeps the texels.
    enum InternalFormat : unsigned int {
        INTERNALFORMAT_ALPHA = 0,              ///< GL_ALPHA
        INTERNALFORMAT_ALPHA4,                 ///< GL_ALPHA4
        INTERNALFORMAT_ALPHA8,                 ///< GL_ALPHA8
        INTERNALFORMAT_ALPHA12,                ///< GL_ALPHA12
        INTERNALFORMAT_ALPHA16,                ///< GL_ALPHA16
        INTERNALFORMAT_LUMINANCE,              ///< GL_LUMINANCE
        INTERNALFORMAT_LUMINANCE4,             ///< GL_LUMINANCE4
        INTERNALFORMAT_LUMINANCE8,             ///< GL_LUMINANCE8
        INTERNALFORMAT_LUMINANCE12,            ///< GL_LUMINANCE12
        INTERNALFORMAT_LUMINANCE16,            ///< GL_LUMINANCE16
        INTERNALFORMAT_LUMINANCE_ALPHA,        ///< GL_LUMINANCE_ALPHA
        INTERNALFORMAT_LUMINANCE4_ALPHA4,      ///< GL_LUMINANCE4_ALPHA4
        INTERNALFORMAT_LUMINANCE6_ALPHA2,      ///< GL_LUMINANCE6_ALPHA2
        INTERNALFORMAT_LUMINANCE8_ALPHA8,      ///< GL_LUMINANCE8_ALPHA8
        INTERNALFORMAT_LUMINANCE12_ALPHA4,     ///< GL_LUMINANCE12_ALPHA4
        INTERNALFORMAT_LUMINANCE12_ALPHA12,    ///< GL_LUMINANCE12_ALPHA12
        INTERNALFORMAT_LUMINANCE16_ALPHA16,    ///< GL_LUMINANCE16_ALPHA16
        INTERNALFORMAT_INTENSITY,              ///< GL_INTENSITY
        INTERNALFORMAT_INTENSITY4,             ///< GL_INTENSITY4
        INTERNALFORMAT_INTENSITY8,             ///< GL_INTENSITY8
        INTERNALFORMAT_INTENSITY12,            ///< GL_INTENSITY12
        INTERNALFORMAT_INTENSITY16,            ///< GL_INTENSITY16
        INTERNALFORMAT_R3_G3_B2,               ///< GL_R3_G3_B2
        INTERNALFORMAT_RED,                    ///< GL_RED
        INTERNALFORMAT_R16,                    ///< GL_R16
        INTERNALFORMAT_R16F,                   ///< GL_R16F
        INTERNALFORMAT_R32F,                   ///< GL_R32F
        INTERNALFORMAT_RG,                     ///< GL_RG
        INTERNALFORMAT_RG16,                   ///< GL_RG16
        INTERNALFORMAT_RG16F,                  ///< GL_RG16F
        INTERNALFORMAT_RG32F,                  ///< GL_RG32F
        INTERNALFORMAT_RGB,                    ///< GL_RGB
        INTERNALFORMAT_RGB4,                   ///< GL_RGB4
        INTERNALFORMAT_RGB5,                   ///< GL_RGB5
        INTERNALFORMAT_RGB8,                   ///< GL_RGB8
        INTERNALFORMAT_RGB10,                  ///< GL_RGB10
        INTERNALFORMAT_RGB12,                  ///< GL_RGB12
        INTERNALFORMAT_RGB16,                  ///< GL_RGB16
        INTERNALFORMAT_RGBA,                   ///< GL_RGBA
        INTERNALFORMAT_RGBA2,                  ///< GL_RGBA2
        INTERNALFORMAT_RGBA4,                  ///< GL_RGBA4
        INTERNALFORMAT_RGB5_A1,                ///< GL_RGB5_A1
        INTERNALFORMAT_RGBA8,                  ///< GL_RGBA8
        INTERNALFORMAT_RGB10_A2,               ///< GL_RGB10_A2
        INTERNALFORMAT_RGBA12,                 ///< GL_RGBA12
        INTERNALFORMAT_RGBA16,                 ///< GL_RGBA16
        INTERNALFORMAT_RGBA32F_ARB,            ///< GL_RGBA32F_ARB
        INTERNALFORMAT_RGB32F_ARB,             ///< GL_RGB32F_ARB
        INTERNALFORMAT_ALPHA32F_ARB,           ///< GL_ALPHA32F_ARB
        INTERNALFORMAT_INTENSITY32F_ARB,       ///< GL_INTENSITY32F_ARB
        INTERNALFORMAT_LUMINANCE32F_ARB,       ///< GL_LUMINANCE32F_ARB
        INTERNALFORMAT_LUMINANCE_ALPHA32F_ARB, ///< GL_LUMINANCE_ALPHA32F_ARB
        INTERNALFORMAT_RGBA16F_ARB,            ///< GL_RGBA16F_ARB
        INTERNALFORMAT_RGB16F_ARB,             ///< GL_RGB16F_ARB
        INTERNALFORMAT_ALPHA16F_ARB,           ///< GL_ALPHA16F_ARB
        INTERNALFORMAT_INTENSITY16F_ARB,       ///< GL_INTENSITY16F_ARB
        INTERNALFORMAT_LUMINANCE16F_ARB,       ///< GL_LUMINANCE16F_ARB
        INTERNALFORMAT_LUMINANCE_ALPHA16F_ARB, ///< GL_LUMINANCE_ALPHA16F_ARB

        // What came after them, numbered apart: red and green of 8 bits by their sized names, sRGB,
        // depth and stencil, integers, and compressed blocks.
        INTERNALFORMAT_R8 = 256,                            ///< GL_R8
        INTERNALFORMAT_RG8,                                 ///< GL_RG8
        INTERNALFORMAT_R11F_G11F_B10F,                      ///< GL_R11F_G11F_B10F
        INTERNALFORMAT_SRGB8,                               ///< GL_SRGB8
        INTERNALFORMAT_SRGB8_ALPHA8,                        ///< GL_SRGB8_ALPHA8
        INTERNALFORMAT_DEPTH_COMPONENT16,                   ///< GL_DEPTH_COMPONENT16
        INTERNALFORMAT_DEPTH_COMPONENT24,                   ///< GL_DEPTH_COMPONENT24
        INTERNALFORMAT_DEPTH_COMPONENT32,                   ///< GL_DEPTH_COMPONENT32
        INTERNALFORMAT_DEPTH_COMPONENT32F,                  ///< GL_DEPTH_COMPONENT32F
        INTERNALFORMAT_DEPTH24_STENCIL8,                    ///< GL_DEPTH24_STENCIL8
        INTERNALFORMAT_DEPTH32F_STENCIL8,                   ///< GL_DEPTH32F_STENCIL8
        INTERNALFORMAT_R8I,                                 ///< GL_R8I
        INTERNALFORMAT_R8UI,                                ///< GL_R8UI
        INTERNALFORMAT_R16I,                                ///< GL_R16I
        INTERNALFORMAT_R16UI,                               ///< GL_R16UI
        INTERNALFORMAT_R32I,                                ///< GL_R32I
        INTERNALFORMAT_R32UI,                               ///< GL_R32UI
        INTERNALFORMAT_RG8I,                                ///< GL_RG8I
        INTERNALFORMAT_RG8UI,                               ///< GL_RG8UI
        INTERNALFORMAT_RG16I,                               ///< GL_RG16I
        INTERNALFORMAT_RG16UI,                              ///< GL_RG16UI
        INTERNALFORMAT_RG32I,                               ///< GL_RG32I
        INTERNALFORMAT_RG32UI,                              ///< GL_RG32UI
        INTERNALFORMAT_RGB8I,                               ///< GL_RGB8I
        INTERNALFORMAT_RGB8UI,                              ///< GL_RGB8UI
        INTERNALFORMAT_RGB16I,                              ///< GL_RGB16I
        INTERNALFORMAT_RGB16UI,                             ///< GL_RGB16UI
        INTERNALFORMAT_RGB32I,                              ///< GL_RGB32I
        INTERNALFORMAT_RGB32UI,                             ///< GL_RGB32UI
        INTERNALFORMAT_RGBA8I,                              ///< GL_RGBA8I
        INTERNALFORMAT_RGBA8UI,                             ///< GL_RGBA8UI
        INTERNALFORMAT_RGBA16I,                             ///< GL_RGBA16I
        INTERNALFORMAT_RGBA16UI,                            ///< GL_RGBA16UI
        INTERNALFORMAT_RGBA32I,                             ///< GL_RGBA32I
        INTERNALFORMAT_RGBA32UI,                            ///< GL_RGBA32UI
        INTERNALFORMAT_RGB10_A2UI,                          ///< GL_RGB10_A2UI
        INTERNALFORMAT_COMPRESSED_RGB_S3TC_DXT1_EXT,        ///< GL_COMPRESSED_RGB_S3TC_DXT1_EXT
        INTERNALFORMAT_COMPRESSED_RGBA_S3TC_DXT1_EXT,       ///< GL_COMPRESSED_RGBA_S3TC_DXT1_EXT
        INTERNALFORMAT_COMPRESSED_RGBA_S3TC_DXT3_EXT,       ///< GL_COMPRESSED_RGBA_S3TC_DXT3_EXT
        INTERNALFORMAT_COMPRESSED_RGBA_S3TC_DXT5_EXT,       ///< GL_COMPRESSED_RGBA_S3TC_DXT5_EXT
        INTERNALFORMAT_COMPRESSED_SRGB_S3TC_DXT1_EXT,       ///< GL_COMPRESSED_SRGB_S3TC_DXT1_EXT
        INTERNALFORMAT_COMPRESSED_SRGB_ALPHA_S3TC_DXT1_EXT, ///< GL_COMPRESSED_SRGB_ALPHA_S3TC_DXT1_EXT
        INTERNALFORMAT_COMPRESSED_SRGB_ALPHA_S3TC_DXT3_EXT, ///< GL_COMPRESSED_SRGB_ALPHA_S3TC_DXT3_EXT
        INTERNALFORMAT_COMPRESSED_SRGB_ALPHA_S3TC_DXT5_EXT, ///< GL_COMPRESSED_SRGB_ALPHA_S3TC_DXT5_EXT
        INTERNALFORMAT_COMPRESSED_RED_RGTC1,                ///< GL_COMPRESSED_RED_RGTC1
        INTERNALFORMAT_COMPRESSED_SIGNED_RED_RGTC1,         ///< GL_COMPRESSED_SIGNED_RED_RGTC1
        INTERNALFORMAT_COMPRESSED_RG_RGTC2,                 ///< GL_COMPRESSED_RG_RGTC2
        INTERNALFORMAT_COMPRESSED_SIGNED_RG_RGTC2,          ///< GL_COMPRESSED_SIGNED_RG_RGTC2
        INTERNALFORMAT_COMPRESSED_RGBA_BPTC_UNORM,          ///< GL_COMPRESSED_RGBA_BPTC_UNORM
        INTERNALFORMAT_COMPRESSED_SRGB_ALPHA_BPTC_UNORM,    ///< GL_COMPRESSED_SRGB_ALPHA_BPTC_UNORM
        INTERNALFORMAT_COMPRESSED_RGB_BPTC_SIGNED_FLOAT,    ///< GL_COMPRESSED_RGB_BPTC_SIGNED_FLOAT
        INTERNALFORMAT_COMPRESSED_RGB_BPTC_UNSIGNED_FLOAT ///< GL_COMPRESSED_RGB_BPTC_UNSIGNED_FLOAT
    };

    /// The components of a pixel in the caller's memory.
    enum Format : unsigned int {
        FORMAT_COLOR_INDEX = 0, ///< GL_COLOR_INDEX
        FORMAT_RED,             ///< GL_RED
        FORMAT_GREEN,           ///< GL_GREEN
        FORMAT_BLUE,            ///< GL_BLUE
        FORMAT_ALPHA,           ///< GL_ALPHA
        FORMAT_RG,              ///< GL_RG
        FORMAT_RGB,             ///< GL_RGB
        FORMAT_BGR,             ///< GL_BGR
        FORMAT_RGBA,            ///< GL_RGBA
        FORMAT_BGRA,            ///< GL_BGRA
        FORMAT_LUMINANCE,       ///< GL_LUMINANCE
        FORMAT_LUMINANCE_ALPHA, ///< GL_LUMINANCE_ALPHA

        // For textures of integers, and of depth and stencil.
        FORMAT_RED_INTEGER = 256, ///< GL_RED_INTEGER
        FORMAT_RG_INTEGER,        ///< GL_RG_INTEGER
        FORMAT_RGB_INTEGER,       ///< GL_RGB_INTEGER
        FORMAT_BGR_INTEGER,       ///< GL_BGR_INTEGER
        FORMAT_RGBA_INTEGER,      ///< GL_RGBA_INTEGER
        FORMAT_BGRA_INTEGER,      ///< GL_BGRA_INTEGER
        FORMAT_DEPTH_COMPONENT,   ///< GL_DEPTH_COMPONENT
        FORMAT_STENCIL_INDEX,     ///< GL_STENCIL_INDEX
        FORMAT_DEPTH_STENCIL      ///< GL_DEPTH_STENCIL
    };

    /// The component type of a pixel in the caller's memory.
    enum Type : unsigned int {
        TYPE_UNSIGNED_BYTE = 0,           ///< GL_UNSIGNED_BYTE
        TYPE_BYTE,                        ///< GL_BYTE
        TYPE_BITMAP,                      ///< GL_BITMAP
        TYPE_UNSIGNED_SHORT,              ///< GL_UNSIGNED_SHORT
        TYPE_SHORT,                       ///< GL_SHORT
        TYPE_UNSIGNED_INT,                ///< GL_UNSIGNED_INT
        TYPE_INT,                         ///< GL_INT
        TYPE_FLOAT,                       ///< GL_FLOAT
        TYPE_UNSIGNED_BYTE_3_3_2,         ///< GL_UNSIGNED_BYTE_3_3_2
        TYPE_UNSIGNED_BYTE_2_3_3_REV,     ///< GL_UNSIGNED_BYTE_2_3_3_REV
        TYPE_UNSIGNED_SHORT_5_6_5,        ///< GL_UNSIGNED_SHORT_5_6_5
        TYPE_UNSIGNED_SHORT_5_6_5_REV,    ///< GL_UNSIGNED_SHORT_5_6_5_REV
        TYPE_UNSIGNED_SHORT_4_4_4_4,      ///< GL_UNSIGNED_SHORT_4_4_4_4
        TYPE_UNSIGNED_SHORT_4_4_4_4_REV,  ///< GL_UNSIGNED_SHORT_4_4_4_4_REV
        TYPE_UNSIGNED_SHORT_5_5_5_1,      ///< GL_UNSIGNED_SHORT_5_5_5_1
        TYPE_UNSIGNED_SHORT_1_5_5_5_REV,  ///< GL_UNSIGNED_SHORT_1_5_5_5_REV
        TYPE_UNSIGNED_INT_8_8_8_8,        ///< GL_UNSIGNED_INT_8_8_8_8
        TYPE_UNSIGNED_INT_8_8_8_8_REV,    ///< GL_UNSIGNED_INT_8_8_8_8_REV
        TYPE_UNSIGNED_INT_10_10_10_2,     ///< GL_UNSIGNED_INT_10_10_10_2
        TYPE_UNSIGNED_INT_2_10_10_10_REV, ///< GL_UNSIGNED_INT_2_10_10_10_REV
        TYPE_HALF_FLOAT,                  ///< GL_HALF_FLOAT

        // Packed pixels of depth with stencil, and of small floats.
        TYPE_UNSIGNED_INT_24_8 = 256,        ///< GL_UNSIGNED_INT_24_8
        TYPE_FLOAT_32_UNSIGNED_INT_24_8_REV, ///< GL_FLOAT_32_UNSIGNED_INT_24_8_REV
        TYPE_UNSIGNED_INT_10F_11F_11F_REV,   ///< GL_UNSIGNED_INT_10F_11F_11F_REV

        TYPE_NONE = 0xFFFFFFFFu ///< where a constructor accepts it: no type is given
    };

    /// How texels are combined for a fragment.
    enum Filter : unsigned int {
        FILTER_NEAREST = 0,            ///< GL_NEAREST
        FILTER_LINEAR,                 ///< GL_LINEAR
        FILTER_NEAREST_MIPMAP_NEAREST, ///< GL_NEAREST_MIPMAP_NEAREST
        FILTER_LINEAR_MIPMAP_NEAREST,  ///< GL_LINEAR_MIPMAP_NEAREST
        FILTER_NEAREST_MIPMAP_LINEAR,  ///< GL_NEAREST_MIPMAP_LINEAR
        FILTER_LINEAR_MIPMAP_LINEAR    ///< GL_LINEAR_MIPMAP_LINEAR
    };

    /// What lies outside the texture.
    enum WrapMode : unsigned int {
        WRAPMODE_CLAMP = 0,       ///< GL_CLAMP
        WRAPMODE_CLAMP_TO_BORDER, ///< GL_CLAMP_TO_BORDER
        WRAPMODE_CLAMP_TO_EDGE,   ///< GL_CLAMP_TO_EDGE
        WRAPMODE_MIRRORED_REPEAT, ///< GL_MIRRORED_REPEAT
        WRAPMODE_REPEAT           ///< GL_REPEAT
    };

    /// Where a channel that shaders read comes from.
    enum Swizzle : unsigned int {
        SWIZZLE_RED = 0, ///< GL_RED
        SWIZZLE_GREEN,   ///< GL_GREEN
        SWIZZLE_BLUE,    ///< GL_BLUE
        SWIZZLE_ALPHA,   ///< GL_ALPHA
        SWIZZLE_ZERO,    ///< GL_ZERO
        SWIZZLE_ONE      ///< GL_ONE
    };

    /// How a shader's reference value is compared with the depth that a texture holds, as the
    /// sampler of a shadow map does: `reference <= depth` for COMPARE_LEQUAL.
    enum Compare : unsigned int {
        COMPARE_NONE = 0, ///< GL_NONE: shaders read the depth itself
        COMPARE_NEVER,    ///< GL_NEVER
        COMPARE_LESS,     ///< GL_LESS
        COMPARE_EQUAL,    ///< GL_EQUAL
        COMPARE_LEQUAL,   ///< GL_LEQUAL
        COMPARE_GREATER,  ///< GL_GREATER
        COMPARE_NOTEQUAL, ///< GL_NOTEQUAL
        COMPARE_GEQUAL,   ///< GL_GEQUAL
        COMPARE_ALWAYS    ///< GL_ALWAYS
    };

    /// The parameters of glPixelStore.
    enum PixelStoreMode : unsigned int {
        PIXELSTOREMODE_PACK_SWAP_BYTES = 0, ///< GL_PACK_SWAP_BYTES
        PIXELSTOREMODE_PACK_LSB_FIRST,      ///< GL_PACK_LSB_FIRST
        PIXELSTOREMODE_PACK_ROW_LENGTH,     ///< GL_PACK_ROW_LENGTH
        PIXELSTOREMODE_PACK_IMAGE_HEIGHT,   ///< GL_PACK_IMAGE_HEIGHT
        PIXELSTOREMODE_PACK_SKIP_PIXELS,    ///< GL_PACK_SKIP_PIXELS
        PIXELSTOREMODE_PACK_SKIP_ROWS,      ///< GL_PACK_SKIP_ROWS
        PIXELSTOREMODE_PACK_SKIP_IMAGES,    ///< GL_PACK_SKIP_IMAGES
        PIXELSTOREMODE_PACK_ALIGNMENT,      ///< GL_PACK_ALIGNMENT
        PIXELSTOREMODE_UNPACK_SWAP_BYTES,   ///< GL_UNPACK_SWAP_BYTES
        PIXELSTOREMODE_UNPACK_LSB_FIRST,    ///< GL_UNPACK_LSB_FIRST
        PIXELSTOREMODE_UNPACK_ROW_LENGTH,   ///< GL_UNPACK_ROW_LENGTH
        PIXELSTOREMODE_UNPACK_IMAGE_HEIGHT, ///< GL_UNPACK_IMAGE_HEIGHT
        PIXELSTOREMODE_UNPACK_SKIP_PIXELS,  ///< GL_UNPACK_SKIP_PIXELS
        PIXELSTOREMODE_UNPACK_SKIP_ROWS,    ///< GL_UNPACK_SKIP_ROWS
        PIXELSTOREMODE_UNPACK_SKIP_IMAGES,  ///< GL_UNPACK_SKIP_IMAGES
        PIXELSTOREMODE_UNPACK_ALIGNMENT     ///< GL_UNPACK_ALIGNMENT
    };

    Texture(Texture &&other) noexcept = default;
    Texture &operator=(Texture &&other) noexcept;

    /// Deletes the texture that the object owns. @note glDeleteTextures
    ~Texture() override;

    /// How the implementation keeps the texels.
    InternalFormat format() const {
        requireObject();
        return format_;
    }

    /// Channels of the format. @throws InternalException for INTERNALFORMAT_RGB4
    std::size_t channels() const { return Channels(format()); }

    /// @name Size of a mip level in texels
    /// The size of level 0 halved `level` times and rounded down, so it can be 0.
    /// @{
    std::uint64_t width(unsigned int level) const;
    std::uint64_t height(unsigned int level) const;
    /// In the array textures the number of layers, or 1, on every level.
    virtual std::uint64_t depth(unsigned int level) const;
    /// @}

    /// Bytes of level 0, found out once. Failures as `SizeInBytes`.
    int sizeInBytes() const;

    /// The GL client format that fits a format best: GL_RED, GL_RG or GL_BGRA, and of the formats
    /// from INTERNALFORMAT_R8 on the one of the same channels.
    unsigned int getGLFormat(InternalFormat format) const;

    /// @name Parameters of the texture bound to the target
    /// @{

    /// How texels are combined where the texture is drawn smaller and larger.
    /// @note glTexParameteri
    void setFilter(Filter minification, Filter magnification);

    /// The colour beyond the edges with WRAPMODE_CLAMP_TO_BORDER.
    /// @param rgba four components
    /// @note glTexParameterfv
    void setBorderColor(float const *rgba);

    /// Whether a change of level 0 makes the other levels anew. A core context cannot do that by
    /// itself: there each upload to level 0 and each copy to it ends with a `generateMipmap()`.
    /// @note glTexParameteri; needs `SupportsAutoMIPGeneration()`
    void enableAutoMIPGeneration(bool on);

    /// Makes the other levels anew from level 0, now.
    /// @throws InternalException where there is no such function
    /// @note glGenerateMipmap (OpenGL 3.0, GL_ARB_framebuffer_object) or glGenerateMipmapEXT
    ///       (GL_EXT_framebuffer_object)
    void generateMipmap();

    /// What shaders read as red, green, blue and alpha.
    /// @throws InternalException without OpenGL 3.3 or GL_ARB_texture_swizzle
    /// @note glTexParameteriv
    void setSwizzle(Swizzle red, Swizzle green, Swizzle blue, Swizzle alpha);

    /// How many texels across may be taken for a pixel where the texture is seen at a slant.
    /// @param ratio from 1, which is none, to `MaxAnisotropy()`
    /// @throws InternalException without GL_EXT_texture_filter_anisotropic, or for another ratio
    /// @note glTexParameterf
    void setMaxAnisotropy(float ratio);

    /// Whether and how shaders get a comparison with the depth in the texture.
    /// @throws InternalException before OpenGL 1.4, or for a number that is no Compare
    /// @note glTexParameteri
    void setCompare(Compare compare);

    /// The levels that are sampled; `generateMipmap` makes those after the first.
    /// @param first, last levels counted from 0
    /// @throws InternalException for a last one before the first, or beyond what OpenGL counts
    /// @note glTexParameteri; needs OpenGL 1.2
    void setLevelRange(unsigned int first, unsigned int last);
    /// @}

    /// @name Compressed formats
    /// Their texels come in blocks of 4 x 4. Uploads of compressed blocks are the kinds' part.
    /// @{

    /// Whether a format is one of compressed blocks.
    static bool IsCompressed(InternalFormat format);

    /// Bytes of a level of this texture, all layers and faces together.
    std::size_t compressedSize(unsigned int level) const;
    /// @}

    /// The most that `setMaxAnisotropy` takes; 1 where there is no such filtering.
    /// @note glGetFloatv
    static float MaxAnisotropy();

    /// Whether the current context has textures of a format, by its version and extensions; false
    /// without a context. Of the formats up to INTERNALFORMAT_LUMINANCE_ALPHA16F_ARB it tells only
    /// whether the profile has them.
    static bool IsFormatSupported(InternalFormat format);

    /// Channels of a format. @throws InternalException for INTERNALFORMAT_RGB4, and for a number
    /// that is no format
    static std::size_t Channels(InternalFormat format);
    /// Channels of a pixel in memory. @throws InternalException for a number that is no format
    static std::size_t Channels(Format format);

    /// Bytes of an image without gaps: channels x bytes of a channel x width x height x depth.
    /// Of a compressed format, and of those numbered from INTERNALFORMAT_R8 on, whole blocks.
    /// @throws InternalException for other formats whose channels are not all of 1, 2 or 4 bytes
    static std::size_t SizeInBytes(InternalFormat format, std::uint64_t width, std::uint64_t height,
                                   std::uint64_t depth);

    /// Whether the current context has textures of a GL target: 1-D, 2-D and 3-D always, rectangles
    /// with GL_ARB_texture_rectangle, arrays with GL_EXT_texture_array, others never.
    static bool IsTargetSupported(unsigned int target);

    /// Whether the current context is of OpenGL 1.4 or later.
    static bool SupportsAutoMIPGeneration();

    /// @name Translations to and from GL values
    /// @throws InternalException for a value outside the enumeration
    /// @{
    static unsigned int Target2GL(Target target);
    static Target GL2Target(unsigned int target);
    static unsigned int TargetBinding2GL(TargetBinding binding);
    static TargetBinding GL2TargetBinding(unsigned int binding);
    static unsigned int InternalFormat2GL(InternalFormat format);
    static InternalFormat GL2InternalFormat(unsigned int format);
    static unsigned int Format2GL(Format format);
    static Format GL2Format(unsigned int format);
    static unsigned int Type2GL(Type type);
    static Type GL2Type(unsigned int type);
    static unsigned int Filter2GL(Filter filter);
    static Filter GL2Filter(unsigned int filter);
    static unsigned int WrapMode2GL(WrapMode mode);
    static WrapMode GL2WrapMode(unsigned int mode);
    static unsigned int PixelStoreMode2GL(PixelStoreMode mode);
    static PixelStoreMode GL2PixelStoreMode(unsigned int mode);
    static unsigned int Swizzle2GL(Swizzle swizzle);
    static Swizzle GL2Swizzle(unsigned int swizzle);
    static unsigned int Compare2GL(Compare compare);
    static Compare GL2Compare(unsigned int compare);
    /// @}

protected:
    /// Makes the texture's name; the storage is the derived classes' part.
    /// @param width, height, depth texels of level 0, 1 for what the target has not
    /// @throws InternalException when there is no name to be had, in a core context for a format of
    ///         alpha, luminance or intensity, and for a format from INTERNALFORMAT_R8 on that the
    ///         context has not
    /// @note glGenTextures
    Texture(Target target, TargetBinding binding, InternalFormat format, std::uint64_t width,
            std::uint64_t height, std::uint64_t depth);

    /// A texture that was made elsewhere. Sizes and format are what level 0 has; GL_R8 and GL_RG8
    /// count as INTERNALFORMAT_RED and INTERNALFORMAT_RG. After a failure the name is the caller's
    /// as before.
    /// @throws InternalException for a name that is no texture, one without level 0, and a format
    ///         that no InternalFormat stands for; ExceptionOGL for a texture of another target
    /// @note glIsTexture, glBindTexture, glGetTexLevelParameteriv
    Texture(Target target, TargetBinding binding, unsigned int name, ownership_tag ownership);

    /// What follows a change of a level's image by the classes; see `enableAutoMIPGeneration`.
    void imageChanged(int level) {
        if (level == 0 && generatesMipmaps_)
            generateMipmap();
    }

    /// @name Checks of uploads and downloads of compressed blocks
    /// @throws InternalException unless the format is compressed and the blocks take so many bytes
    /// @{
    void checkCompressed(std::uint64_t width, std::uint64_t height, std::uint64_t depth,
                         std::size_t bytes) const;
    /// The same for all of a level, of which `depth` images are read. Also for a negative level.
    void checkCompressedLevel(int level, std::uint64_t depth, std::size_t bytes) const;
    /// @}

    /// Kept for hosts that call it; there is nothing to verify.
    void verifyCurrentTextureObject() const {}

    /// Bytes of a pixel in the caller's memory.
    /// @throws InternalException for types other than bytes, shorts, half floats and floats; with a
    ///         format from FORMAT_RED_INTEGER on, integers of 32 bits and the packed types of depth
    ///         have a size, too
    static std::size_t BytesPerPixel(Format format, Type type);

    /// @name Client pixel-store state around a transfer
    /// Saves the state and sets the alignment of rows; the last one puts the saved state back.
    /// @param bytes 1, 2, 4 or 8
    /// @throws InternalException for any other number, and in a core context (where up to 16 states
    ///         are saved, of packing or unpacking) for a saved one too many or too few
    /// @note glPushClientAttrib, glPixelStorei, glPopClientAttrib; in a core context glGetIntegerv
    ///       and glPixelStorei
    /// @{
    static void PushAndSetReadbackByteAlignment(unsigned int bytes);
    static void PushAndSetTransferByteAlignment(unsigned int bytes);
    static void PopPixelTransferModes();
    /// @}

private:
    void deleteObject() noexcept;

    InternalFormat format_;
    std::uint64_t width_;
    std::uint64_t height_;
    std::uint64_t depth_;
    mutable std::uint64_t sizeInBytes_ : 63; ///< all ones: not computed yet
    std::uint64_t generatesMipmaps_ : 1;     ///< only what a core context does not by itself
};

/// Writes the enumerator's name ("INTERNALFORMAT_RGBA8"), or "UNKNOWN FORMAT".
ORU_API std::ostream &operator<<(std::ostream &os, Texture::InternalFormat format);

} // namespace ORU::OGL
