// Texture units, their state, and the scope that draws with one texture.
#include "texturekinds.h"

#include "oru/oru_ogl/ogl/texturebindscope.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"

using namespace ORU::OGL;
using namespace oru_test;

namespace {

GLint Get(GLenum name) {
    GLint value = -1;
    ORU_GL(GetIntegerv, name, &value);
    return value;
}

/// The members of TextureUnit for one target.
struct UnitTarget {
    GLenum target;
    GLenum binding;
    void (TextureUnit::*bindDefault)() const;
    void (TextureUnit::*enable)() const;
    void (TextureUnit::*disable)() const;
    bool (TextureUnit::*isEnabled)() const;
};

UnitTarget const kUnitTargets[] = {
    {GL_TEXTURE_1D, GL_TEXTURE_BINDING_1D, &TextureUnit::bind1DDefault, &TextureUnit::enable1D,
     &TextureUnit::disable1D, &TextureUnit::isEnabled1D},
    {GL_TEXTURE_2D, GL_TEXTURE_BINDING_2D, &TextureUnit::bind2DDefault, &TextureUnit::enable2D,
     &TextureUnit::disable2D, &TextureUnit::isEnabled2D},
    {GL_TEXTURE_3D, GL_TEXTURE_BINDING_3D, &TextureUnit::bind3DDefault, &TextureUnit::enable3D,
     &TextureUnit::disable3D, &TextureUnit::isEnabled3D},
    {GL_TEXTURE_RECTANGLE, GL_TEXTURE_BINDING_RECTANGLE, &TextureUnit::bindRECTDefault,
     &TextureUnit::enableRECT, &TextureUnit::disableRECT, &TextureUnit::isEnabledRECT},
    {GL_TEXTURE_2D_ARRAY, GL_TEXTURE_BINDING_2D_ARRAY, &TextureUnit::bind2DArrayDefault, nullptr,
     nullptr, nullptr},
};

/// The unit's private question, reached by an explicit instantiation, which may name it.
template<bool (TextureUnit::*Member)() const>
struct Opened {
    friend bool IsActive(TextureUnit const &unit) { return (unit.*Member)(); }
};
template struct Opened<&TextureUnit::verifyActiveTexture>;
bool IsActive(TextureUnit const &unit);

} // namespace

class TextureUnitTest : public ObjectTest {};

TEST_F(TextureUnitTest, ActsOnTheActiveUnit) {
    Texture1D const one(Texture::INTERNALFORMAT_RGBA8, 4, false);
    Texture2D const two(Texture::INTERNALFORMAT_RGBA8, 4, 4, false);
    TextureRECT const rectangle(Texture::INTERNALFORMAT_RGBA8, 4, 4);
    Texture3D const three(Texture::INTERNALFORMAT_RGBA8, 4, 4, 4, false);
    Texture2DArray const array(Texture::INTERNALFORMAT_RGBA8, 4, 4, 4, false);
    for (unsigned int const index : {3u, 0u}) {
        TextureState::SetActiveTextureUnit(index);
        EXPECT_EQ(index, TextureState::ActiveTextureUnit());
        EXPECT_TRUE(IsActive(*TextureUnit::Unit(index)));
        EXPECT_FALSE(IsActive(*TextureUnit::Unit(3 - index)));
        TextureUnit const &unit = *TextureUnit::Unit(index);
        unit.bind(&one);
        unit.bind(&two);
        unit.bind(&rectangle);
        unit.bind(&three);
        unit.bind(&array);
        for (Texture const *texture :
             {static_cast<Texture const *>(&one), static_cast<Texture const *>(&two),
              static_cast<Texture const *>(&rectangle), static_cast<Texture const *>(&three),
              static_cast<Texture const *>(&array)})
            EXPECT_TRUE(texture->isBound());
        for (UnitTarget const &row : kUnitTargets) {
            (unit.*row.bindDefault)();
            EXPECT_EQ(0, Get(row.binding));
            if (!row.enable)
                continue;
            EXPECT_FALSE((unit.*row.isEnabled)());
            (unit.*row.enable)();
            EXPECT_TRUE((unit.*row.isEnabled)());
            EXPECT_EQ(GL_TRUE, ORU_GL(IsEnabled, row.target));
            (unit.*row.disable)();
            EXPECT_EQ(GL_FALSE, ORU_GL(IsEnabled, row.target));
        }
        unit.bind(GL_TEXTURE_2D, two.objectID());
        EXPECT_TRUE(two.isBound());
        unit.bind2DDefault();
    }
    EXPECT_EQ("GL_INVALID_ENUM", MessageOf([] { TextureState::SetActiveTextureUnit(1000); }));
    EXPECT_NE(TextureUnit::Unit(0), TextureUnit::Unit(3));
}

TEST_F(TextureUnitTest, SetsEveryEnvironment) {
    unsigned int const modes[] = {0x0104, 0x0BE2, 0x8570, 0x2101, 0x2100, 0x1E01};
    for (unsigned int i = 0; i < 6; ++i) {
        auto const environment = static_cast<TextureUnit::Environment>(i);
        EXPECT_EQ(modes[i], TextureUnit::Environment2GL(environment));
        EXPECT_EQ(environment, TextureUnit::GL2Environment(modes[i]));
        TextureUnit::Unit(0)->setEnv(environment);
        GLint mode = 0;
        ORU_GL(GetTexEnviv, GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, &mode);
        EXPECT_EQ(static_cast<GLint>(modes[i]), mode);
    }
    std::string const failure = "!\"Environment enums are not all properly translated.\"";
    EXPECT_EQ(failure, MessageOf([] { TextureUnit::GL2Environment(GL_LINEAR); }));
    EXPECT_EQ(failure, MessageOf([] {
                  TextureUnit::Environment2GL(static_cast<TextureUnit::Environment>(6));
              }));
}

TEST_F(TextureUnitTest, ScopeLeavesTheUnitEmptyAndTheOtherActive) {
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 4, 4, false);
    Bind(texture);
    texture.setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
    texture.setWrap(Texture::WRAPMODE_REPEAT, Texture::WRAPMODE_REPEAT);
    Unbind(texture);
    TextureState::SetActiveTextureUnit(2);
    {
        Texture2DBindScope const scope(&texture, 0, true);
        EXPECT_EQ(0u, TextureState::ActiveTextureUnit());
        EXPECT_TRUE(texture.isBound());
        EXPECT_TRUE(TextureUnit::Unit(0)->isEnabled2D());
        GLint mode = 0;
        ORU_GL(GetTexEnviv, GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, &mode);
        EXPECT_EQ(GL_REPLACE, mode);
    }
    EXPECT_EQ(2u, TextureState::ActiveTextureUnit());
    TextureState::SetActiveTextureUnit(0);
    EXPECT_EQ(0, Get(GL_TEXTURE_BINDING_2D));
    EXPECT_FALSE(TextureUnit::Unit(0)->isEnabled2D());
    Bind(texture);
    for (auto const &[parameter, expected] : {std::pair(GL_TEXTURE_MIN_FILTER, GL_NEAREST),
                                              std::pair(GL_TEXTURE_MAG_FILTER, GL_NEAREST),
                                              std::pair(GL_TEXTURE_WRAP_S, GL_CLAMP_TO_EDGE),
                                              std::pair(GL_TEXTURE_WRAP_T, GL_CLAMP_TO_EDGE)}) {
        GLint value = 0;
        ORU_GL(GetTexParameteriv, GL_TEXTURE_2D, static_cast<GLenum>(parameter), &value);
        EXPECT_EQ(expected, value);
    }
    Unbind(texture);
}

TEST_F(TextureUnitTest, ScopeMayBeInactiveOrFail) {
    {
        Pushed<CountingForwarder> counter;
        Texture2DBindScope const scope(nullptr, 3, false);
        EXPECT_EQ(0, counter->total());
    }
    EXPECT_EQ("theTexture", MessageOf([] { Texture2DBindScope const scope(nullptr, 3, true); }));

    // There is no such unit; the active one stays.
    TextureState::SetActiveTextureUnit(1);
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 4, 4, false);
    EXPECT_EQ("GL_INVALID_ENUM",
              MessageOf([&] { Texture2DBindScope const scope(&texture, 1000, true); }));
    EXPECT_EQ(1u, TextureState::ActiveTextureUnit());
    TextureState::SetActiveTextureUnit(0);
}
