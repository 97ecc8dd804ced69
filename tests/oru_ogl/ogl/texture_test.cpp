// Texture objects: construction of every kind, sizes, parameters and translations.
#include "tests/support/texturekinds.h"
#include "tests/support/translations.h"

using namespace oru_test;

namespace {

Sides LevelSides(GLenum target, int level) {
    Sides sides;
    ORU_GL(GetTexLevelParameteriv, target, level, GL_TEXTURE_WIDTH, &sides[0]);
    ORU_GL(GetTexLevelParameteriv, target, level, GL_TEXTURE_HEIGHT, &sides[1]);
    ORU_GL(GetTexLevelParameteriv, target, level, GL_TEXTURE_DEPTH, &sides[2]);
    return sides;
}

} // namespace

TEST(TextureTables, TranslateBothWays) {
    using T = Texture;
    ExpectTranslation("Target", T::Target2GL, T::GL2Target,
                      "TEXTURE_1D TEXTURE_2D TEXTURE_3D TEXTURE_1D_ARRAY TEXTURE_2D_ARRAY "
                      "TEXTURE_RECTANGLE");
    ExpectTranslation("Target", T::TargetBinding2GL, T::GL2TargetBinding,
                      "TEXTURE_BINDING_1D TEXTURE_BINDING_2D TEXTURE_BINDING_3D "
                      "TEXTURE_BINDING_1D_ARRAY TEXTURE_BINDING_2D_ARRAY "
                      "TEXTURE_BINDING_RECTANGLE");
    ExpectTranslation("InternalFormat", T::InternalFormat2GL, T::GL2InternalFormat,
                      "ALPHA ALPHA4 ALPHA8 ALPHA12 ALPHA16 LUMINANCE LUMINANCE4 LUMINANCE8 "
                      "LUMINANCE12 LUMINANCE16 LUMINANCE_ALPHA LUMINANCE4_ALPHA4 "
                      "LUMINANCE6_ALPHA2 LUMINANCE8_ALPHA8 LUMINANCE12_ALPHA4 "
                      "LUMINANCE12_ALPHA12 LUMINANCE16_ALPHA16 INTENSITY INTENSITY4 INTENSITY8 "
                      "INTENSITY12 INTENSITY16 R3_G3_B2 RED R16 R16F R32F RG RG16 RG16F RG32F RGB "
                      "RGB4 RGB5 RGB8 RGB10 RGB12 RGB16 RGBA RGBA2 RGBA4 RGB5_A1 RGBA8 RGB10_A2 "
                      "RGBA12 RGBA16 RGBA32F RGB32F ALPHA32F_ARB INTENSITY32F_ARB LUMINANCE32F_ARB "
                      "LUMINANCE_ALPHA32F_ARB RGBA16F RGB16F ALPHA16F_ARB INTENSITY16F_ARB "
                      "LUMINANCE16F_ARB LUMINANCE_ALPHA16F_ARB");
    ExpectTranslation("Format", T::Format2GL, T::GL2Format,
                      "COLOR_INDEX RED GREEN BLUE ALPHA RG RGB BGR RGBA BGRA LUMINANCE "
                      "LUMINANCE_ALPHA");
    // The last one is GL_HALF_FLOAT, too.
    ExpectTranslation("Type", T::Type2GL, T::GL2Type,
                      "UNSIGNED_BYTE BYTE BITMAP UNSIGNED_SHORT SHORT UNSIGNED_INT INT FLOAT "
                      "UNSIGNED_BYTE_3_3_2 UNSIGNED_BYTE_2_3_3_REV UNSIGNED_SHORT_5_6_5 "
                      "UNSIGNED_SHORT_5_6_5_REV UNSIGNED_SHORT_4_4_4_4 UNSIGNED_SHORT_4_4_4_4_REV "
                      "UNSIGNED_SHORT_5_5_5_1 UNSIGNED_SHORT_1_5_5_5_REV UNSIGNED_INT_8_8_8_8 "
                      "UNSIGNED_INT_8_8_8_8_REV UNSIGNED_INT_10_10_10_2 "
                      "UNSIGNED_INT_2_10_10_10_REV HALF_APPLE");
    ExpectTranslation("Filter", T::Filter2GL, T::GL2Filter,
                      "NEAREST LINEAR NEAREST_MIPMAP_NEAREST LINEAR_MIPMAP_NEAREST "
                      "NEAREST_MIPMAP_LINEAR LINEAR_MIPMAP_LINEAR");
    ExpectTranslation("WrapMode", T::WrapMode2GL, T::GL2WrapMode,
                      "CLAMP CLAMP_TO_BORDER CLAMP_TO_EDGE MIRRORED_REPEAT REPEAT");
    std::string modes;
    for (std::string const direction : {"PACK_", "UNPACK_"}) {
        for (char const *const mode : {"SWAP_BYTES ", "LSB_FIRST ", "ROW_LENGTH ", "IMAGE_HEIGHT ",
                                       "SKIP_PIXELS ", "SKIP_ROWS ", "SKIP_IMAGES ", "ALIGNMENT "})
            modes += direction + mode;
    }
    ExpectTranslation("PixelStoreMode", T::PixelStoreMode2GL, T::GL2PixelStoreMode, modes);
}

// Each format's bytes of a channel; - where its channels are of other sizes, ! where it has none.
TEST(TextureTables, NameAndSizeFormats) {
    std::string const bytes = "1-1-21-1-21--1--21-1-2-122412241!-1--21---1--2444444222222";
    for (unsigned int i = 0; i < bytes.size(); ++i) {
        auto const format = static_cast<Texture::InternalFormat>(i);
        auto const size = [&] { return Texture::SizeInBytes(format, 2, 3, 5); };
        std::string const name = ORUOGLTokenName(Texture::InternalFormat2GL(format));
        if (bytes[i] == '!')
            EXPECT_FAILURE("InternalFormat enums are not all properly sized.", size());
        else if (bytes[i] == '-')
            EXPECT_FAILURE("Texture::SizeInBytes Unknown color channels for format " + name,
                           size());
        else
            EXPECT_EQ(Texture::Channels(format) * 30 * Size(bytes[i] - '0'), size()) << i;
        EXPECT_EQ(0u, testing::PrintToString(format).find("INTERNALFORMAT_" + name.substr(3)));
    }
    std::string const unsized = "InternalFormat enums are not all properly sized.";
    EXPECT_FAILURE(unsized, Texture::Channels(Texture::INTERNALFORMAT_RGB4));
    EXPECT_FAILURE(unsized, Texture::Channels(static_cast<Texture::Format>(12)));
    EXPECT_EQ("UNKNOWN FORMAT", testing::PrintToString(static_cast<Texture::InternalFormat>(58)));
}

class TextureTest : public ObjectTest {};

// Every kind: its levels, the binding that its constructor found, and its parameters.
TEST_F(TextureTest, IsAllocatedAndLeavesTheBindingAlone) {
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const occupant(kind.make(Texture::INTERNALFORMAT_RGBA8, {2, 2, 2}, false));
        for (bool const mipmapped : {false, true}) {
            occupant.bind();
            Sides level = kind.cut({8, 5, 4});
            auto made = kind.make(Texture::INTERNALFORMAT_RGBA8, level, mipmapped);
            EXPECT_TRUE(occupant->isBound());
            EXPECT_FALSE(made->isBound());
            BoundTexture const texture(std::move(made));
            EXPECT_EQ(kind.target, texture->target());
            EXPECT_EQ(static_cast<GLint>(texture->objectID()), Get(kind.binding));
            EXPECT_EQ(4 * level[0] * level[1] * level[2], texture->sizeInBytes());
            int const levels = mipmapped && kind.mipmaps() ? 4 : 1;
            for (int i = 0; i < levels; ++i, level = kind.halved(level))
                EXPECT_EQ(level, LevelSides(kind.target, i)) << "level " << i;
            if (kind.mipmaps()) {
                EXPECT_EQ(0, LevelSides(kind.target, levels)[0]);
            }
            std::vector<GLint> expected = {GL_NEAREST, GL_NEAREST};
            expected.resize(2 + kind.sides, GL_CLAMP_TO_EDGE);
            EXPECT_EQ(expected, Sampling(kind.target, kind.sides));
        }
    }
}

TEST_F(TextureTest, SetsParametersOfTheBoundTexture) {
    std::array<float, 4> const red = {1, 0, 0, 1};
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RGBA8, {4, 4, 4}, false));
        texture->setFilter(Texture::FILTER_LINEAR, Texture::FILTER_NEAREST);
        Texture::WrapMode const s = Texture::WRAPMODE_CLAMP_TO_BORDER, t = Texture::WRAPMODE_CLAMP,
                                r = Texture::WRAPMODE_REPEAT;
        if (auto *const one = dynamic_cast<Texture1 *>(&*texture)) {
            one->setWrap(s);
        } else if (auto *const two = dynamic_cast<Texture2 *>(&*texture)) {
            ORU_GL(BindTexture, kind.target, 0u);
            EXPECT_FAILURE("Texture must be enabled (bound & active)", two->setWrap(t, s));
            texture.bind();
            two->setWrap(s, t);
        } else {
            dynamic_cast<Texture3 &>(*texture).setWrap(s, t, r);
        }
        std::vector<GLint> expected = {GL_LINEAR, GL_NEAREST, GL_CLAMP_TO_BORDER, GL_CLAMP,
                                       GL_REPEAT};
        expected.resize(2 + kind.sides);
        EXPECT_EQ(expected, Sampling(kind.target, kind.sides));

        texture->setBorderColor(red.data());
        std::array<float, 4> border = {};
        ORU_GL(GetTexParameterfv, kind.target, GL_TEXTURE_BORDER_COLOR, border.data());
        EXPECT_EQ(red, border);
        for (int i = 1; i >= 0 && kind.mipmaps(); --i) {
            texture->enableAutoMIPGeneration(i == 1);
            GLint automatic = -1;
            ORU_GL(GetTexParameteriv, kind.target, GL_GENERATE_MIPMAP, &automatic);
            EXPECT_EQ(i, automatic);
        }
    }
}

TEST_F(TextureTest, TellsItsSizePerLevel) {
    Texture2D const plane(Texture::INTERNALFORMAT_RG16, 8, 5, true);
    std::vector<std::uint64_t> const sizes = {plane.width(0),  plane.width(3),  plane.width(4),
                                              plane.width(64), plane.height(1), plane.depth(1)};
    EXPECT_EQ((std::vector<std::uint64_t>{8, 1, 0, 0, 2, 0}), sizes);
    EXPECT_EQ(2u, plane.channels());
    EXPECT_EQ(1u, Texture1DArray(Texture::INTERNALFORMAT_RED, 8, 6, true).depth(2));
    EXPECT_EQ(6u, Texture2DArray(Texture::INTERNALFORMAT_RED, 8, 8, 6, true).depth(2));
    EXPECT_EQ(1u, Texture3D(Texture::INTERNALFORMAT_RED, 8, 8, 6, true).depth(2));
    for (unsigned int i = 0; i < 58; ++i) {
        GLenum const expected = i >= 23 && i < 27 ? GL_RED : i >= 27 && i < 31 ? GL_RG : GL_BGRA;
        EXPECT_EQ(expected, plane.getGLFormat(static_cast<Texture::InternalFormat>(i))) << i;
    }
}

// OpenGL refuses the size: the name goes, the binding stays, and a size that would wrap around as a
// 32-bit number is refused too.
TEST_F(TextureTest, FailedConstructionLeavesNothing) {
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const occupant(kind.make(Texture::INTERNALFORMAT_RGBA8, {2, 2, 2}, false));
        Pushed<NameLedger> ledger;
        EXPECT_FAILURE("GL_INVALID_VALUE",
                       kind.make(Texture::INTERNALFORMAT_RGBA8, {1 << 15, 4, 4}, false));
        EXPECT_EQ(1, ledger->made());
        EXPECT_EQ("", ledger->leaks());
        EXPECT_TRUE(occupant->isBound());
    }
    EXPECT_FAILURE("GL_INVALID_VALUE",
                   Texture2D(Texture::INTERNALFORMAT_RGBA8, (1ull << 32) + 4, 4, false));
    EXPECT_FAILURE("!\"InternalFormat enums are not all properly translated.\"",
                   Texture1D(static_cast<Texture::InternalFormat>(58), 4, false));
    char pixels[64] = {};
    EXPECT_FAILURE("ExtensionManager::Instance()->isSupported(GL_APPLE_CLIENT_STORAGE)",
                   Texture2D(Texture::INTERNALFORMAT_RGBA8, 4, 4, false, pixels));
}
