// Texture objects: construction of every kind, sizes, parameters and translations.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/extensionator/opengltokenname.h"

using namespace oru_test;

namespace {

GLint Parameter(Texture const &texture, GLenum parameter) {
    GLint value = -1;
    ORU_GL(GetTexParameteriv, texture.target(), parameter, &value);
    return value;
}

Sides LevelSides(GLenum target, int level) {
    Sides sides;
    ORU_GL(GetTexLevelParameteriv, target, level, GL_TEXTURE_WIDTH, &sides[0]);
    ORU_GL(GetTexLevelParameteriv, target, level, GL_TEXTURE_HEIGHT, &sides[1]);
    ORU_GL(GetTexLevelParameteriv, target, level, GL_TEXTURE_DEPTH, &sides[2]);
    return sides;
}

/// Both ways through one enumeration with these GL values, and what lies outside of it.
template<class Enumeration>
void CheckTranslation(unsigned int (*toGL)(Enumeration), Enumeration (*fromGL)(unsigned int),
                      std::string const &name, std::vector<unsigned int> const &values) {
    SCOPED_TRACE(name);
    std::string const failure = "!\"" + name + " enums are not all properly translated.\"";
    for (std::size_t i = 0; i < values.size(); ++i) {
        EXPECT_EQ(values[i], toGL(static_cast<Enumeration>(i))) << i;
        EXPECT_EQ(i, fromGL(values[i]));
    }
    EXPECT_FAILURE(failure, toGL(static_cast<Enumeration>(values.size())));
    EXPECT_FAILURE(failure, fromGL(0x8889));
}

} // namespace

TEST(TextureTables, TranslateBothWays) {
    CheckTranslation(Texture::Target2GL, Texture::GL2Target, "Target",
                     {0x0DE0, 0x0DE1, 0x806F, 0x8C18, 0x8C1A, 0x84F5});
    CheckTranslation(Texture::TargetBinding2GL, Texture::GL2TargetBinding, "Target",
                     {0x8068, 0x8069, 0x806A, 0x8C1C, 0x8C1D, 0x84F6});
    CheckTranslation(Texture::InternalFormat2GL, Texture::GL2InternalFormat, "InternalFormat",
                     {0x1906, 0x803B, 0x803C, 0x803D, 0x803E, 0x1909, 0x803F, 0x8040, 0x8041,
                      0x8042, 0x190A, 0x8043, 0x8044, 0x8045, 0x8046, 0x8047, 0x8048, 0x8049,
                      0x804A, 0x804B, 0x804C, 0x804D, 0x2A10, 0x1903, 0x822A, 0x822D, 0x822E,
                      0x8227, 0x822C, 0x822F, 0x8230, 0x1907, 0x804F, 0x8050, 0x8051, 0x8052,
                      0x8053, 0x8054, 0x1908, 0x8055, 0x8056, 0x8057, 0x8058, 0x8059, 0x805A,
                      0x805B, 0x8814, 0x8815, 0x8816, 0x8817, 0x8818, 0x8819, 0x881A, 0x881B,
                      0x881C, 0x881D, 0x881E, 0x881F});
    CheckTranslation(Texture::Format2GL, Texture::GL2Format, "Format",
                     {0x1900, 0x1903, 0x1904, 0x1905, 0x1906, 0x8227, 0x1907, 0x80E0, 0x1908,
                      0x80E1, 0x1909, 0x190A});
    CheckTranslation(Texture::Type2GL, Texture::GL2Type, "Type",
                     {0x1401, 0x1400, 0x1A00, 0x1403, 0x1402, 0x1405, 0x1404,
                      0x1406, 0x8032, 0x8362, 0x8363, 0x8364, 0x8033, 0x8365,
                      0x8034, 0x8366, 0x8035, 0x8367, 0x8036, 0x8368, 0x140B});
    CheckTranslation(Texture::Filter2GL, Texture::GL2Filter, "Filter",
                     {0x2600, 0x2601, 0x2700, 0x2701, 0x2702, 0x2703});
    CheckTranslation(Texture::WrapMode2GL, Texture::GL2WrapMode, "WrapMode",
                     {0x2900, 0x812D, 0x812F, 0x8370, 0x2901});
    CheckTranslation(Texture::PixelStoreMode2GL, Texture::GL2PixelStoreMode, "PixelStoreMode",
                     {0x0D00, 0x0D01, 0x0D02, 0x806C, 0x0D04, 0x0D03, 0x806B, 0x0D05, 0x0CF0,
                      0x0CF1, 0x0CF2, 0x806E, 0x0CF4, 0x0CF3, 0x806D, 0x0CF5});
}

// Each format's bytes of a channel; - where its channels are of other sizes, ! where it has none.
TEST(TextureTables, NameAndSizeFormats) {
    std::string const bytes = "1-1-21-1-21--1--21-1-2-122412241!-1--21---1--2444444222222";
    for (unsigned int i = 0; i < 58; ++i) {
        auto const format = static_cast<Texture::InternalFormat>(i);
        auto const size = [&] { return Texture::SizeInBytes(format, 2, 3, 5); };
        if (bytes[i] == '!')
            EXPECT_FAILURE("InternalFormat enums are not all properly sized.", size());
        else if (bytes[i] == '-')
            EXPECT_FAILURE("Texture::SizeInBytes Unknown color channels for format " +
                               std::string(ORUOGLTokenName(Texture::InternalFormat2GL(format))),
                           size());
        else
            EXPECT_EQ(Texture::Channels(format) * 30 * Size(bytes[i] - '0'), size()) << i;
    }
    std::string const unsized = "InternalFormat enums are not all properly sized.";
    EXPECT_FAILURE(unsized, Texture::Channels(Texture::INTERNALFORMAT_RGB4));
    EXPECT_FAILURE(unsized, Texture::Channels(static_cast<Texture::Format>(12)));
    std::ostringstream names;
    for (unsigned int const value : {0u, 42u, 57u, 58u})
        names << static_cast<Texture::InternalFormat>(value) << '\n';
    EXPECT_EQ("INTERNALFORMAT_ALPHA\nINTERNALFORMAT_RGBA8\nINTERNALFORMAT_LUMINANCE_ALPHA16F_ARB\n"
              "UNKNOWN FORMAT\n",
              names.str());
}

class TextureTest : public ObjectTest {};

// Every kind: its levels, its parameters, and the binding that its constructor found.
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
            EXPECT_TRUE(texture->isBound());
            EXPECT_EQ(kind.target, texture->target());
            EXPECT_EQ(static_cast<GLint>(texture->objectID()), Get(kind.binding));
            EXPECT_EQ(4 * level[0] * level[1] * level[2], texture->sizeInBytes());
            int const levels = mipmapped && kind.mipmaps() ? 4 : 1;
            for (int i = 0; i < levels; ++i, level = kind.halved(level))
                EXPECT_EQ(level, LevelSides(kind.target, i)) << "level " << i;
            if (kind.mipmaps()) {
                EXPECT_EQ(0, LevelSides(kind.target, levels)[0]);
            }
            EXPECT_EQ(GL_NEAREST, Parameter(*texture, GL_TEXTURE_MIN_FILTER));
            EXPECT_EQ(GL_NEAREST, Parameter(*texture, GL_TEXTURE_MAG_FILTER));
            GLenum const wraps[] = {GL_TEXTURE_WRAP_S, GL_TEXTURE_WRAP_T, GL_TEXTURE_WRAP_R};
            for (std::size_t side = 0; side < kind.sides; ++side)
                EXPECT_EQ(GL_CLAMP_TO_EDGE, Parameter(*texture, wraps[side]));
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

TEST_F(TextureTest, SetsParametersOfTheBoundTexture) {
    std::array<float, 4> const red = {1, 0, 0, 1};
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RGBA8, {4, 4, 4}, false));
        texture->setFilter(Texture::FILTER_LINEAR, Texture::FILTER_NEAREST);
        EXPECT_EQ(GL_LINEAR, Parameter(*texture, GL_TEXTURE_MIN_FILTER));
        EXPECT_EQ(GL_NEAREST, Parameter(*texture, GL_TEXTURE_MAG_FILTER));
        texture->setBorderColor(red.data());
        std::array<float, 4> border = {};
        ORU_GL(GetTexParameterfv, kind.target, GL_TEXTURE_BORDER_COLOR, border.data());
        EXPECT_EQ(red, border);
        for (bool const on : {true, false}) {
            if (kind.mipmaps()) {
                texture->enableAutoMIPGeneration(on);
                EXPECT_EQ(on, Parameter(*texture, GL_GENERATE_MIPMAP));
            }
        }
        Texture::WrapMode const s = Texture::WRAPMODE_CLAMP_TO_BORDER, t = Texture::WRAPMODE_CLAMP,
                                r = Texture::WRAPMODE_REPEAT;
        if (auto *const one = dynamic_cast<Texture1 *>(&*texture)) {
            one->setWrap(s);
        } else if (auto *const two = dynamic_cast<Texture2 *>(&*texture)) {
            two->setWrap(s, t);
            ORU_GL(BindTexture, kind.target, 0u);
            EXPECT_FAILURE("Texture must be enabled (bound & active)", two->setWrap(t, s));
            texture.bind();
        } else {
            dynamic_cast<Texture3 &>(*texture).setWrap(s, t, r);
            EXPECT_EQ(GL_REPEAT, Parameter(*texture, GL_TEXTURE_WRAP_R));
        }
        EXPECT_EQ(GL_CLAMP_TO_BORDER, Parameter(*texture, GL_TEXTURE_WRAP_S));
        if (kind.sides > 1) {
            EXPECT_EQ(GL_CLAMP, Parameter(*texture, GL_TEXTURE_WRAP_T));
        }
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
