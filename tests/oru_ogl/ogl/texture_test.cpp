// Texture objects: construction of every kind, sizes, parameters and translations.
#include "texturekinds.h"

#include <algorithm>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

GLint LevelParameter(GLenum target, int level, GLenum parameter) {
    GLint value = -1;
    ORU_GL(GetTexLevelParameteriv, target, level, parameter, &value);
    return value;
}

GLint Parameter(Texture const &texture, GLenum parameter) {
    GLint value = -1;
    ORU_GL(GetTexParameteriv, texture.target(), parameter, &value);
    return value;
}

Sides LevelSides(GLenum target, int level) {
    return {LevelParameter(target, level, GL_TEXTURE_WIDTH),
            LevelParameter(target, level, GL_TEXTURE_HEIGHT),
            LevelParameter(target, level, GL_TEXTURE_DEPTH)};
}

/// Both ways through one enumeration, its first and last GL value, and what lies outside of it.
template<class Enumeration>
void CheckTranslation(unsigned int (*toGL)(Enumeration), Enumeration (*fromGL)(unsigned int),
                      unsigned int count, unsigned int first, unsigned int last,
                      std::string const &name) {
    SCOPED_TRACE(name);
    std::string const failure = "!\"" + name + " enums are not all properly translated.\"";
    for (unsigned int i = 0; i < count; ++i)
        EXPECT_EQ(i, fromGL(toGL(static_cast<Enumeration>(i))));
    EXPECT_EQ(first, toGL(static_cast<Enumeration>(0)));
    EXPECT_EQ(last, toGL(static_cast<Enumeration>(count - 1)));
    EXPECT_EQ(failure, MessageOf([&] { toGL(static_cast<Enumeration>(count)); }));
    EXPECT_EQ(failure, MessageOf([&] { fromGL(0x8889); }));
}

} // namespace

TEST(TextureTables, TranslateBothWays) {
    CheckTranslation(Texture::Target2GL, Texture::GL2Target, 6, 0x0DE0, 0x84F5, "Target");
    // The query enumeration has the target's failure text.
    CheckTranslation(Texture::TargetBinding2GL, Texture::GL2TargetBinding, 6, 0x8068, 0x84F6,
                     "Target");
    CheckTranslation(Texture::InternalFormat2GL, Texture::GL2InternalFormat, 58, 0x1906, 0x881F,
                     "InternalFormat");
    CheckTranslation(Texture::Format2GL, Texture::GL2Format, 12, 0x1900, 0x190A, "Format");
    CheckTranslation(Texture::Type2GL, Texture::GL2Type, 21, 0x1401, 0x140B, "Type");
    CheckTranslation(Texture::Filter2GL, Texture::GL2Filter, 6, 0x2600, 0x2703, "Filter");
    CheckTranslation(Texture::WrapMode2GL, Texture::GL2WrapMode, 5, 0x2900, 0x2901, "WrapMode");
    CheckTranslation(Texture::PixelStoreMode2GL, Texture::GL2PixelStoreMode, 16, 0x0D00, 0x0CF5,
                     "PixelStoreMode");
}

TEST(TextureTables, NameAndSizeFormats) {
    std::ostringstream names;
    for (unsigned int const value : {0u, 42u, 57u, 58u})
        names << static_cast<Texture::InternalFormat>(value) << '\n';
    EXPECT_EQ("INTERNALFORMAT_ALPHA\nINTERNALFORMAT_RGBA8\nINTERNALFORMAT_LUMINANCE_ALPHA16F_ARB\n"
              "UNKNOWN FORMAT\n",
              names.str());
    EXPECT_EQ(128u, Texture::SizeInBytes(Texture::INTERNALFORMAT_RGBA16F_ARB, 4, 4, 1));
    EXPECT_EQ(32u, Texture::SizeInBytes(Texture::INTERNALFORMAT_RG32F, 2, 2, 1));
    EXPECT_EQ("Texture::SizeInBytes Unknown color channels for format GL_RGBA4",
              MessageOf([] { Texture::SizeInBytes(Texture::INTERNALFORMAT_RGBA4, 4, 4, 1); }));
    std::string const unsized = "InternalFormat enums are not all properly sized.";
    EXPECT_EQ(unsized,
              MessageOf([] { Texture::SizeInBytes(Texture::INTERNALFORMAT_RGB4, 4, 4, 1); }));
    EXPECT_EQ(unsized, MessageOf([] { Texture::Channels(Texture::INTERNALFORMAT_RGB4); }));
    EXPECT_EQ(unsized, MessageOf([] { Texture::Channels(static_cast<Texture::Format>(12)); }));
}

class TextureTest : public ObjectTest {};

// Every kind: its levels, its parameters, and the binding that its constructor found.
TEST_F(TextureTest, IsAllocatedAndLeavesTheBindingAlone) {
    Sides const size = {8, 5, 4};
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        auto const occupant = kind.make(Texture::INTERNALFORMAT_RGBA8, {2, 2, 2}, false);
        Bind(*occupant);
        for (bool const mipmapped : {false, true}) {
            auto const texture = kind.make(Texture::INTERNALFORMAT_RGBA8, size, mipmapped);
            EXPECT_TRUE(occupant->isBound());
            EXPECT_EQ(kind.target, texture->target());
            EXPECT_TRUE(texture->isInitialized());
            EXPECT_FALSE(texture->isBound());
            Bind(*texture);
            EXPECT_TRUE(texture->isBound());
            EXPECT_EQ(static_cast<GLint>(texture->objectID()), [&] {
                GLint bound = 0;
                ORU_GL(GetIntegerv, kind.binding, &bound);
                return bound;
            }());

            Sides level = kind.cut(size);
            EXPECT_EQ(4 * level[0] * level[1] * level[2], texture->sizeInBytes());
            int const levels = mipmapped && kind.mipmaps ? 4 : 1;
            for (int i = 0; i < levels; ++i) {
                EXPECT_EQ(level, LevelSides(kind.target, i)) << "level " << i;
                for (std::size_t side = 0; side < kind.sides; ++side)
                    level[side] = side == kind.layers ? level[side] : std::max(1, level[side] / 2);
            }
            if (kind.mipmaps) {
                EXPECT_EQ(0, LevelParameter(kind.target, levels, GL_TEXTURE_WIDTH));
            }
            EXPECT_EQ(GL_NEAREST, Parameter(*texture, GL_TEXTURE_MIN_FILTER));
            EXPECT_EQ(GL_NEAREST, Parameter(*texture, GL_TEXTURE_MAG_FILTER));
            GLenum const wraps[] = {GL_TEXTURE_WRAP_S, GL_TEXTURE_WRAP_T, GL_TEXTURE_WRAP_R};
            for (std::size_t side = 0; side < kind.sides; ++side)
                EXPECT_EQ(GL_CLAMP_TO_EDGE, Parameter(*texture, wraps[side]));
            Bind(*occupant);
        }
        Unbind(*occupant);
    }
}

TEST_F(TextureTest, TellsItsSizePerLevel) {
    Texture2D const plane(Texture::INTERNALFORMAT_RG16, 8, 5, true);
    EXPECT_EQ(8u, plane.width(0));
    EXPECT_EQ(1u, plane.width(3));
    EXPECT_EQ(0u, plane.width(4));
    EXPECT_EQ(0u, plane.width(64));
    EXPECT_EQ(2u, plane.height(1));
    EXPECT_EQ(0u, plane.depth(1));
    EXPECT_EQ(2u, plane.channels());
    EXPECT_EQ(Texture::INTERNALFORMAT_RG16, plane.format());
    EXPECT_EQ(nullptr, plane.clientStorage());
    EXPECT_EQ(1u, Texture1DArray(Texture::INTERNALFORMAT_RED, 8, 6, true).depth(2));
    EXPECT_EQ(6u, Texture2DArray(Texture::INTERNALFORMAT_RED, 8, 8, 6, true).depth(2));
    EXPECT_EQ(1u, Texture3D(Texture::INTERNALFORMAT_RED, 8, 8, 6, true).depth(2));

    for (unsigned int i = 0; i < 58; ++i) {
        GLenum const expected = i >= 23 && i < 27 ? GL_RED : i >= 27 && i < 31 ? GL_RG : GL_BGRA;
        EXPECT_EQ(expected, plane.getGLFormat(static_cast<Texture::InternalFormat>(i))) << i;
    }
}

TEST_F(TextureTest, SetsParametersOfTheBoundTexture) {
    float const red[] = {1, 0, 0, 1};
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        auto const texture = kind.make(Texture::INTERNALFORMAT_RGBA8, {4, 4, 4}, false);
        auto *const two = dynamic_cast<Texture2 *>(texture.get());
        if (two) {
            EXPECT_EQ("Texture must be enabled (bound & active)", MessageOf([&] {
                          two->setWrap(Texture::WRAPMODE_CLAMP, Texture::WRAPMODE_CLAMP);
                      }));
        }
        Bind(*texture);
        texture->setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
        EXPECT_EQ(GL_LINEAR, Parameter(*texture, GL_TEXTURE_MIN_FILTER));
        texture->setBorderColor(red);
        float border[4] = {};
        ORU_GL(GetTexParameterfv, kind.target, GL_TEXTURE_BORDER_COLOR, border);
        EXPECT_TRUE(std::equal(red, red + 4, border));
        if (kind.mipmaps) {
            texture->enableAutoMIPGeneration(true);
            EXPECT_EQ(1, Parameter(*texture, GL_GENERATE_MIPMAP));
            texture->enableAutoMIPGeneration(false);
            EXPECT_EQ(0, Parameter(*texture, GL_GENERATE_MIPMAP));
        }
        if (auto *const one = dynamic_cast<Texture1 *>(texture.get()))
            one->setWrap(Texture::WRAPMODE_CLAMP_TO_BORDER);
        else if (two)
            two->setWrap(Texture::WRAPMODE_CLAMP, Texture::WRAPMODE_CLAMP_TO_BORDER);
        else
            dynamic_cast<Texture3 &>(*texture).setWrap(Texture::WRAPMODE_CLAMP,
                                                       Texture::WRAPMODE_REPEAT,
                                                       Texture::WRAPMODE_CLAMP_TO_BORDER);
        GLenum const last[] = {GL_TEXTURE_WRAP_S, GL_TEXTURE_WRAP_T, GL_TEXTURE_WRAP_R};
        EXPECT_EQ(GL_CLAMP_TO_BORDER, Parameter(*texture, last[kind.sides - 1]));
        Unbind(*texture);
    }
}

// OpenGL refuses the size: the name goes, the binding stays, and a size that would wrap around as a
// 32-bit number is refused too.
TEST_F(TextureTest, FailedConstructionLeavesNothing) {
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        auto const occupant = kind.make(Texture::INTERNALFORMAT_RGBA8, {2, 2, 2}, false);
        Bind(*occupant);
        Pushed<NameLedger> ledger;
        EXPECT_EQ("GL_INVALID_VALUE", MessageOf([&] {
                      kind.make(Texture::INTERNALFORMAT_RGBA8, {1 << 15, 4, 4}, false);
                  }));
        EXPECT_EQ(1, ledger->made());
        EXPECT_EQ("", ledger->leaks());
        EXPECT_TRUE(occupant->isBound());
        Unbind(*occupant);
    }
    EXPECT_EQ("GL_INVALID_VALUE", MessageOf([] {
                  Texture2D(Texture::INTERNALFORMAT_RGBA8, (std::uint64_t(1) << 32) + 4, 4, false);
              }));
    EXPECT_EQ("!\"InternalFormat enums are not all properly translated.\"",
              MessageOf([] { Texture1D(static_cast<Texture::InternalFormat>(58), 4, false); }));
    EXPECT_EQ("ExtensionManager::Instance()->isSupported(GL_APPLE_CLIENT_STORAGE)", MessageOf([] {
                  char pixels[64] = {};
                  Texture2D(Texture::INTERNALFORMAT_RGBA8, 4, 4, false, pixels);
              }));
}

using LostContextTest = OffscreenTest;

// The objects of a context go with it; their destructors find no context, or another one.
TEST_F(LostContextTest, IsSurvivedByDestructors) {
    std::vector<std::unique_ptr<Texture>> textures;
    std::unique_ptr<Buffer> buffer;
    {
        ContextOffscreen other;
        other.makeCurrent();
        for (TextureKind const &kind : kTextureKinds)
            textures.push_back(kind.make(Texture::INTERNALFORMAT_RGBA8, {2, 2, 2}, false));
        buffer = std::make_unique<Buffer>(4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW,
                                          nullptr);
    }
    ReleaseOGLContext();
    textures.resize(3);
    buffer.reset();
    EXPECT_NE("", MessageOf([] { Texture2D(Texture::INTERNALFORMAT_RGBA8, 4, 4, false); }));
    context().makeCurrent();
    textures.clear();
}
