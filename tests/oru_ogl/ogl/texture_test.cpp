// Texture objects: construction of every kind, sizes, parameters and translations.
#include "tests/support/texturekinds.h"
#include "tests/support/translations.h"

#include "oru/oru_ogl/extensionator/opengltokenname.h"

using namespace oru_test;

namespace {

GLint OfLevel(GLenum target, int level, GLenum name) {
    GLint value = -1;
    ORU_GL(GetTexLevelParameteriv, target, level, name, &value);
    return value;
}

Sides LevelSides(GLenum target, int level) {
    return {OfLevel(target, level, GL_TEXTURE_WIDTH), OfLevel(target, level, GL_TEXTURE_HEIGHT),
            OfLevel(target, level, GL_TEXTURE_DEPTH)};
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

class TextureTest : public ObjectTest {};

// Each format's bytes, - where its channels are of different or unknown sizes. Core contexts refuse
// what OpenGL lacks there.
TEST_F(TextureTest, KnowsEveryInternalFormat) {
    std::string const bytes = "1-1-21-1-22--2--41-1-2-122424483--3--64---4--8gc4448862224";
    for (unsigned int i = 0; i < bytes.size(); ++i) {
        auto const format = static_cast<Texture::InternalFormat>(i);
        auto const glFormat = static_cast<GLint>(Texture::InternalFormat2GL(format));
        std::string const name = testing::PrintToString(format);
        std::string const token = ORUOGLTokenName(Texture::InternalFormat2GL(format));
        SCOPED_TRACE(name);
        EXPECT_EQ(0u, name.find("INTERNALFORMAT_" + token.substr(3)));
        auto const size = [&] { return Texture::SizeInBytes(format, 2, 3, 5); };
        if (bytes[i] == '-')
            EXPECT_NE("", MessageOf(size));
        else
            EXPECT_EQ(30 * std::stoul(bytes.substr(i, 1), nullptr, 36), size());
        ::glTexImage2D(GL_PROXY_TEXTURE_2D, 0, glFormat, 4, 4, 0, GL_RGBA, GL_FLOAT, nullptr);
        EXPECT_FAILURE(::glGetError() == GL_NO_ERROR
                           ? ""
                           : name + " needs a compatibility context: in a core one use a format of "
                                    "red, or of red and green",
                       Texture2D(format, 4, 4, false));
    }
}

// Every kind: its levels, and the binding that its constructor found, also when OpenGL refuses the
// size (and the fixture misses no name).
TEST_F(TextureTest, IsAllocatedAndLeavesTheBindingAlone) {
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const occupant(kind.make(kRGBA8, {2, 2, 2}, false));
        for (bool const mipmapped : {false, true}) {
            occupant.bind();
            Sides level = kind.cut({8, 5, 4});
            auto made = kind.make(kRGBA8, level, mipmapped);
            EXPECT_TRUE(occupant->isBound());
            EXPECT_FALSE(made->isBound());
            BoundTexture const texture(std::move(made));
            EXPECT_TRUE(texture->isBound());
            EXPECT_EQ(GL_RGBA8, OfLevel(kind.target, 0, GL_TEXTURE_INTERNAL_FORMAT));
            EXPECT_EQ(4 * level[0] * level[1] * level[2], texture->sizeInBytes());
            EXPECT_EQ(Size(level[0] / 2), texture->width(1));
            EXPECT_EQ(0u, texture->width(64));
            int const levels = mipmapped && kind.mipmaps() ? 4 : 1;
            for (int i = 0; i < levels; ++i, level = kind.halved(level))
                EXPECT_EQ(level, LevelSides(kind.target, i)) << "level " << i;
            EXPECT_TRUE(!kind.mipmaps() || LevelSides(kind.target, levels)[0] == 0);
            std::vector<GLint> expected = {GL_NEAREST, GL_NEAREST};
            expected.resize(2 + kind.sides, GL_CLAMP_TO_EDGE);
            EXPECT_EQ(expected, Sampling(kind.target, kind.sides));
        }
        occupant.bind();
        EXPECT_FAILURE("GL_INVALID_VALUE", kind.make(kRGBA8, {1 << 15, 4, 4}, false));
        EXPECT_TRUE(occupant->isBound());
    }
    EXPECT_FAILURE("GL_INVALID_VALUE", Texture2D(kRGBA8, (1ull << 32) + 4, 4, false))
        << "it would wrap around as a 32-bit number";
}

// Core contexts refuse GL_CLAMP before any call.
TEST_F(TextureTest, SetsParametersOfTheBoundTexture) {
    std::string const refusal = IsCoreRun() ? "WRAPMODE_CLAMP needs a compatibility context: in a "
                                              "core one use WRAPMODE_CLAMP_TO_EDGE"
                                            : "";
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const texture(kind.make(kRGBA8, {4, 4, 4}, false));
        texture->setFilter(Texture::FILTER_LINEAR, Texture::FILTER_NEAREST);
        auto const setWrap = [&texture](std::array<Texture::WrapMode, 3> const &modes) {
            AsItsClass(*texture, [&](auto &as, auto... side) { as.setWrap(modes[side]...); });
        };
        auto const border = Texture::WRAPMODE_CLAMP_TO_BORDER, repeat = Texture::WRAPMODE_REPEAT,
                   edge = Texture::WRAPMODE_CLAMP_TO_EDGE, clamp = Texture::WRAPMODE_CLAMP;
        setWrap({border, edge, repeat});
        std::vector<GLint> expected = {GL_LINEAR, GL_NEAREST, GL_CLAMP_TO_BORDER, GL_CLAMP_TO_EDGE,
                                       GL_REPEAT};
        expected.resize(2 + kind.sides);
        EXPECT_EQ(expected, Sampling(kind.target, kind.sides));
        EXPECT_FAILURE(refusal, setWrap({clamp, clamp, clamp}));
        if (!IsCoreRun())
            std::fill(expected.begin() + 2, expected.end(), GL_CLAMP);
        EXPECT_EQ(expected, Sampling(kind.target, kind.sides));
        std::array<float, 4> const colour = {0.25f, 0.5f, 0.75f, 1};
        texture->setBorderColor(colour.data());
        std::array<float, 4> actual = {};
        ::glGetTexParameterfv(kind.target, GL_TEXTURE_BORDER_COLOR, actual.data());
        EXPECT_EQ(colour, actual);
    }
    Texture2D plane(kRGBA8, 4, 4, false);
    EXPECT_FAILURE("Texture must be enabled (bound & active)",
                   plane.setWrap(Texture::WRAPMODE_CLAMP, Texture::WRAPMODE_CLAMP));
}
