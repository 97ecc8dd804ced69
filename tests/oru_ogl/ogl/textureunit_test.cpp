// Texture units, their state, and the scope that draws with one texture.
#include "tests/support/texturekinds.h"
#include "tests/support/translations.h"

#include "oru/oru_ogl/ogl/texturebindscope.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"

using namespace oru_test;

namespace {

using U = TextureUnit;
using Operation = void (U::*)() const;

char const kFixedFunction[] =
    "Fixed-function texturing needs a compatibility context: in a core one "
    "bind the texture and sample it in a shader";

/// Binds a texture in both ways, and enables its target unless it is one of shaders only, as all
/// are in a core context.
template<class Kind>
void ExpectActs(U const &unit, Kind const &texture, Operation bindDefault,
                Operation enable = nullptr, Operation disable = nullptr,
                bool (U::*isEnabled)() const = nullptr) {
    unit.bind(&texture);
    EXPECT_TRUE(texture.isBound());
    (unit.*bindDefault)();
    EXPECT_EQ(0u, texture.getBoundID());
    unit.bind(texture.target(), texture.objectID());
    EXPECT_TRUE(texture.isBound());
    (unit.*bindDefault)();
    if (!enable)
        return;
    if (IsCoreRun()) {
        EXPECT_FAILURE(kFixedFunction, (unit.*isEnabled)());
        EXPECT_FAILURE(kFixedFunction, (unit.*enable)());
        EXPECT_FAILURE(kFixedFunction, (unit.*disable)());
        return;
    }
    EXPECT_FALSE((unit.*isEnabled)());
    (unit.*enable)();
    EXPECT_TRUE((unit.*isEnabled)() && ::glIsEnabled(texture.target()));
    (unit.*disable)();
    EXPECT_FALSE(::glIsEnabled(texture.target()));
}

} // namespace

class TextureUnitTest : public ObjectTest {};

TEST_F(TextureUnitTest, ActsOnTheActiveUnit) {
    auto const format = Texture::INTERNALFORMAT_RGBA8;
    for (unsigned int const index : {3u, 0u}) {
        TextureState::SetActiveTextureUnit(index);
        EXPECT_EQ(index, TextureState::ActiveTextureUnit());
        EXPECT_EQ(static_cast<GLint>(GL_TEXTURE0 + index), Get(GL_ACTIVE_TEXTURE));
        U const &unit = *U::Unit(index);
        ExpectActs(unit, Texture1D(format, 4, false), &U::bind1DDefault, &U::enable1D,
                   &U::disable1D, &U::isEnabled1D);
        ExpectActs(unit, Texture2D(format, 4, 4, false), &U::bind2DDefault, &U::enable2D,
                   &U::disable2D, &U::isEnabled2D);
        ExpectActs(unit, TextureRECT(format, 4, 4), &U::bindRECTDefault, &U::enableRECT,
                   &U::disableRECT, &U::isEnabledRECT);
        ExpectActs(unit, Texture3D(format, 4, 4, 4, false), &U::bind3DDefault, &U::enable3D,
                   &U::disable3D, &U::isEnabled3D);
        ExpectActs(unit, Texture2DArray(format, 4, 4, 4, false), &U::bind2DArrayDefault);
    }
    EXPECT_FAILURE(IsCoreRun() ? kFixedFunction : "", U::Unit(0)->setEnv(U::ENVIRONMENT_ADD));
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
        EXPECT_TRUE(plane.isBound());
        if (!IsCoreRun()) {
            GLint mode = 0;
            ORU_GL(GetTexEnviv, GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, &mode);
            EXPECT_EQ(GL_REPLACE, mode);
            EXPECT_TRUE(TextureUnit::Unit(0)->isEnabled2D());
        }
    }
    EXPECT_EQ(2u, TextureState::ActiveTextureUnit());
    TextureState::SetActiveTextureUnit(0);
    EXPECT_EQ(0u, plane.getBoundID());
    EXPECT_TRUE(IsCoreRun() || !TextureUnit::Unit(0)->isEnabled2D());
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
