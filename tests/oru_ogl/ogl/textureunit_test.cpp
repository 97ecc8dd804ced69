// Texture units, their state, and the scope that draws with one texture.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/texturebindscope.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"

using namespace oru_test;

namespace {

/// The unit's private question, reached by an explicit instantiation, which may name it.
template<bool (TextureUnit::*Member)() const>
struct Opened {
    friend bool IsActive(TextureUnit const &unit) { return (unit.*Member)(); }
};
template struct Opened<&TextureUnit::verifyActiveTexture>;
bool IsActive(TextureUnit const &unit);

void ExpectBound(TextureUnit const &unit, Texture const &texture,
                 void (TextureUnit::*bindDefault)() const) {
    EXPECT_TRUE(texture.isBound());
    (unit.*bindDefault)();
    EXPECT_EQ(0u, texture.getBoundID());
    unit.bind(texture.target(), texture.objectID());
    EXPECT_TRUE(texture.isBound());
    (unit.*bindDefault)();
}

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
        ExpectBound(unit, one, &TextureUnit::bind1DDefault);
        ExpectBound(unit, two, &TextureUnit::bind2DDefault);
        ExpectBound(unit, rectangle, &TextureUnit::bindRECTDefault);
        ExpectBound(unit, three, &TextureUnit::bind3DDefault);
        ExpectBound(unit, array, &TextureUnit::bind2DArrayDefault);
#define ORU_CHECK(Target, gl)                                                                      \
    EXPECT_FALSE(unit.isEnabled##Target());                                                        \
    unit.enable##Target();                                                                         \
    EXPECT_TRUE(unit.isEnabled##Target() && ::glIsEnabled(gl));                                    \
    unit.disable##Target();                                                                        \
    EXPECT_FALSE(::glIsEnabled(gl));
        ORU_CHECK(1D, GL_TEXTURE_1D)
        ORU_CHECK(2D, GL_TEXTURE_2D)
        ORU_CHECK(3D, GL_TEXTURE_3D)
        ORU_CHECK(RECT, GL_TEXTURE_RECTANGLE)
#undef ORU_CHECK
    }
    EXPECT_FAILURE("GL_INVALID_ENUM", TextureState::SetActiveTextureUnit(1000));
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
    EXPECT_FAILURE(failure, TextureUnit::GL2Environment(GL_LINEAR));
    EXPECT_FAILURE(failure, TextureUnit::Environment2GL(static_cast<TextureUnit::Environment>(6)));
}

TEST_F(TextureUnitTest, ScopeLeavesTheUnitEmptyAndTheOtherActive) {
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 4, 4, false);
    TextureUnit::Unit(0)->bind(&texture);
    texture.setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
    texture.setWrap(Texture::WRAPMODE_REPEAT, Texture::WRAPMODE_REPEAT);
    TextureUnit::Unit(0)->bind2DDefault();
    TextureState::SetActiveTextureUnit(2);
    {
        Texture2DBindScope const scope(&texture, 0, true);
        EXPECT_EQ(0u, TextureState::ActiveTextureUnit());
        EXPECT_TRUE(texture.isBound() && TextureUnit::Unit(0)->isEnabled2D());
        GLint mode = 0;
        ORU_GL(GetTexEnviv, GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, &mode);
        EXPECT_EQ(GL_REPLACE, mode);
    }
    EXPECT_EQ(2u, TextureState::ActiveTextureUnit());
    TextureState::SetActiveTextureUnit(0);
    EXPECT_EQ(0u, texture.getBoundID());
    EXPECT_FALSE(TextureUnit::Unit(0)->isEnabled2D());
    TextureUnit::Unit(0)->bind(&texture);
    std::pair<GLenum, GLint> const kept[] = {{GL_TEXTURE_MIN_FILTER, GL_NEAREST},
                                             {GL_TEXTURE_MAG_FILTER, GL_NEAREST},
                                             {GL_TEXTURE_WRAP_S, GL_CLAMP_TO_EDGE},
                                             {GL_TEXTURE_WRAP_T, GL_CLAMP_TO_EDGE}};
    for (auto const &[parameter, expected] : kept) {
        GLint value = 0;
        ORU_GL(GetTexParameteriv, GL_TEXTURE_2D, parameter, &value);
        EXPECT_EQ(expected, value);
    }
    TextureUnit::Unit(0)->bind2DDefault();
}

TEST_F(TextureUnitTest, ScopeMayBeInactiveOrFail) {
    {
        Pushed<CountingForwarder> counter;
        Texture2DBindScope const scope(nullptr, 3, false);
        EXPECT_EQ(0, counter->total());
    }
    EXPECT_FAILURE("theTexture", Texture2DBindScope const scope(nullptr, 3, true));

    // There is no such unit; the active one stays.
    TextureState::SetActiveTextureUnit(1);
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 4, 4, false);
    EXPECT_FAILURE("GL_INVALID_ENUM", Texture2DBindScope const scope(&texture, 1000, true));
    EXPECT_EQ(1u, TextureState::ActiveTextureUnit());
    TextureState::SetActiveTextureUnit(0);
}
