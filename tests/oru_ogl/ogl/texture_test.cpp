// Texture objects: construction of every kind, sizes, parameters and translations.
#include "tests/support/texturekinds.h"
#include "tests/support/translations.h"

#include "oru/oru_ogl/extensionator/opengltokenname.h"

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
    ExpectTranslation("Target", T::Target2GL, T::GL2Target, 6, GL_TEXTURE_RECTANGLE);
    ExpectTranslation("Target", T::TargetBinding2GL, T::GL2TargetBinding, 6,
                      GL_TEXTURE_BINDING_RECTANGLE);
    ExpectTranslation("InternalFormat", T::InternalFormat2GL, T::GL2InternalFormat, 58,
                      GL_LUMINANCE_ALPHA16F_ARB);
    ExpectTranslation("Format", T::Format2GL, T::GL2Format, 12, GL_LUMINANCE_ALPHA);
    ExpectTranslation("Type", T::Type2GL, T::GL2Type, 21, GL_HALF_FLOAT);
    ExpectTranslation("Filter", T::Filter2GL, T::GL2Filter, 6, GL_LINEAR_MIPMAP_LINEAR);
    ExpectTranslation("WrapMode", T::WrapMode2GL, T::GL2WrapMode, 5, GL_REPEAT);
    ExpectTranslation("PixelStoreMode", T::PixelStoreMode2GL, T::GL2PixelStoreMode, 16,
                      GL_UNPACK_ALIGNMENT);
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
        Texture::WrapMode const s = Texture::WRAPMODE_CLAMP_TO_BORDER,
                                t = IsCoreRun() ? Texture::WRAPMODE_CLAMP_TO_EDGE
                                                : Texture::WRAPMODE_CLAMP,
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
        std::vector<GLint> expected = {GL_LINEAR, GL_NEAREST, GL_CLAMP_TO_BORDER,
                                       static_cast<GLint>(Texture::WrapMode2GL(t)), GL_REPEAT};
        expected.resize(2 + kind.sides);
        EXPECT_EQ(expected, Sampling(kind.target, kind.sides));

        texture->setBorderColor(red.data());
        std::array<float, 4> border = {};
        ORU_GL(GetTexParameterfv, kind.target, GL_TEXTURE_BORDER_COLOR, border.data());
        EXPECT_EQ(red, border);
        for (int i = 1; i >= 0 && kind.mipmaps() && !IsCoreRun(); --i) {
            texture->enableAutoMIPGeneration(i == 1);
            GLint automatic = -1;
            ORU_GL(GetTexParameteriv, kind.target, GL_GENERATE_MIPMAP, &automatic);
            EXPECT_EQ(i, automatic);
        }
    }
}

// Before any call, and in core contexts only.
TEST_F(TextureTest, ClampIsOfCompatibilityContexts) {
    std::string const expected = IsCoreRun() ? "WRAPMODE_CLAMP needs a compatibility context: in a "
                                               "core one use WRAPMODE_CLAMP_TO_EDGE"
                                             : "";
    auto const clamp = Texture::WRAPMODE_CLAMP, repeat = Texture::WRAPMODE_REPEAT;
    Texture1D line(Texture::INTERNALFORMAT_RED, 4, false);
    Texture2D plane(Texture::INTERNALFORMAT_RED, 4, 4, false);
    Texture3D solid(Texture::INTERNALFORMAT_RED, 4, 4, 4, false);
    ORU_GL(BindTexture, GL_TEXTURE_2D, plane.objectID());
    Pushed<CountingForwarder> calls;
    EXPECT_FAILURE(expected, line.setWrap(clamp));
    EXPECT_FAILURE(expected, plane.setWrap(repeat, clamp));
    EXPECT_FAILURE(expected, solid.setWrap(repeat, repeat, clamp));
    EXPECT_EQ(IsCoreRun() ? 0 : 6, calls->count("TexParameteri"));
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

// OpenGL refuses the size: the binding stays (and the fixture misses no name), and a size that
// would wrap around as a 32-bit number is refused too.
TEST_F(TextureTest, FailedConstructionLeavesNothing) {
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const occupant(kind.make(Texture::INTERNALFORMAT_RGBA8, {2, 2, 2}, false));
        EXPECT_FAILURE("GL_INVALID_VALUE",
                       kind.make(Texture::INTERNALFORMAT_RGBA8, {1 << 15, 4, 4}, false));
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
