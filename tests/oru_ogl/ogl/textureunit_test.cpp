// Texture units, their state, and the scope that draws with one texture.
#include "tests/support/texturekinds.h"
#include "tests/support/translations.h"

#include "oru/oru_ogl/ogl/texturebindscope.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"

using namespace oru_test;

namespace {

template<class Kind>
void ExpectBinding(TextureUnit const &unit, Kind const &texture,
                   void (TextureUnit::*bindDefault)() const) {
    unit.bind(&texture);
    EXPECT_TRUE(texture.isBound());
    (unit.*bindDefault)();
    EXPECT_EQ(0u, texture.getBoundID());
    unit.bind(texture.target(), texture.objectID());
    EXPECT_TRUE(texture.isBound());
    (unit.*bindDefault)();
}

struct Enabling {
    GLenum target;
    void (TextureUnit::*enable)() const;
    void (TextureUnit::*disable)() const;
    bool (TextureUnit::*isEnabled)() const;
};

#define ORU_ENABLING(Target, gl)                                                                   \
    {                                                                                              \
        gl, &TextureUnit::enable##Target, &TextureUnit::disable##Target,                           \
            &TextureUnit::isEnabled##Target                                                        \
    }
Enabling const kEnablings[] = {ORU_ENABLING(1D, GL_TEXTURE_1D), ORU_ENABLING(2D, GL_TEXTURE_2D),
                               ORU_ENABLING(3D, GL_TEXTURE_3D),
                               ORU_ENABLING(RECT, GL_TEXTURE_RECTANGLE)};
#undef ORU_ENABLING

} // namespace

class TextureUnitTest : public ObjectTest {};

TEST_F(TextureUnitTest, ActsOnTheActiveUnit) {
    auto const format = Texture::INTERNALFORMAT_RGBA8;
    for (unsigned int const index : {3u, 0u}) {
        TextureState::SetActiveTextureUnit(index);
        EXPECT_EQ(index, TextureState::ActiveTextureUnit());
        EXPECT_EQ(static_cast<GLint>(GL_TEXTURE0 + index), Get(GL_ACTIVE_TEXTURE));
        TextureUnit const &unit = *TextureUnit::Unit(index);
        ExpectBinding(unit, Texture1D(format, 4, false), &TextureUnit::bind1DDefault);
        ExpectBinding(unit, Texture2D(format, 4, 4, false), &TextureUnit::bind2DDefault);
        ExpectBinding(unit, TextureRECT(format, 4, 4), &TextureUnit::bindRECTDefault);
        ExpectBinding(unit, Texture3D(format, 4, 4, 4, false), &TextureUnit::bind3DDefault);
        ExpectBinding(unit, Texture2DArray(format, 4, 4, 4, false),
                      &TextureUnit::bind2DArrayDefault);
        for (Enabling const &row : kEnablings) {
            EXPECT_FALSE((unit.*row.isEnabled)());
            (unit.*row.enable)();
            EXPECT_TRUE((unit.*row.isEnabled)() && ::glIsEnabled(row.target));
            (unit.*row.disable)();
            EXPECT_FALSE(::glIsEnabled(row.target));
        }
    }
    EXPECT_FAILURE("GL_INVALID_ENUM", TextureState::SetActiveTextureUnit(1000));
    ExpectTranslation("Environment", TextureUnit::Environment2GL, TextureUnit::GL2Environment, 6,
                      GL_REPLACE);
}

TEST_F(TextureUnitTest, ScopeLeavesTheUnitEmptyAndTheOtherActive) {
    BoundTexture const texture(
        std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA8, 4, 4, false));
    auto &plane = dynamic_cast<Texture2D &>(*texture);
    plane.setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
    plane.setWrap(Texture::WRAPMODE_REPEAT, Texture::WRAPMODE_REPEAT);
    TextureUnit::Unit(0)->bind2DDefault();
    TextureState::SetActiveTextureUnit(2);
    {
        Texture2DBindScope const scope(&plane, 0, true);
        EXPECT_EQ(0u, TextureState::ActiveTextureUnit());
        EXPECT_TRUE(plane.isBound() && TextureUnit::Unit(0)->isEnabled2D());
        GLint mode = 0;
        ORU_GL(GetTexEnviv, GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, &mode);
        EXPECT_EQ(GL_REPLACE, mode);
    }
    EXPECT_EQ(2u, TextureState::ActiveTextureUnit());
    TextureState::SetActiveTextureUnit(0);
    EXPECT_EQ(0u, plane.getBoundID());
    EXPECT_FALSE(TextureUnit::Unit(0)->isEnabled2D());
    texture.bind();
    EXPECT_EQ((std::vector<GLint>{GL_NEAREST, GL_NEAREST, GL_CLAMP_TO_EDGE, GL_CLAMP_TO_EDGE}),
              Sampling(GL_TEXTURE_2D, 2));

    // Inactive, or without a texture, or on a unit that there is not: the active one stays.
    TextureState::SetActiveTextureUnit(1);
    {
        Pushed<CountingForwarder> calls;
        Texture2DBindScope const scope(nullptr, 3, false);
        EXPECT_EQ(0, calls->total());
    }
    EXPECT_FAILURE("theTexture", Texture2DBindScope const scope(nullptr, 3, true));
    EXPECT_FAILURE("GL_INVALID_ENUM", Texture2DBindScope const scope(&plane, 1000, true));
    EXPECT_EQ(1u, TextureState::ActiveTextureUnit());
    TextureState::SetActiveTextureUnit(0);
}
