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

char const *const kRefusal = IsCoreRun()
                                 ? "Fixed-function texturing needs a compatibility context: in a "
                                   "core one bind the texture and sample it in a shader"
                                 : "";

template<class Kind>
void ExpectBinds(U const &unit, Kind const &texture, Operation bindDefault) {
    unit.bind(&texture);
    EXPECT_TRUE(texture.isBound());
    (unit.*bindDefault)();
    EXPECT_EQ(0u, texture.getBoundID());
    unit.bind(texture.target(), texture.objectID());
    EXPECT_TRUE(texture.isBound());
    (unit.*bindDefault)();
}

void ExpectEnables(U const &unit, GLenum target, Operation enable, Operation disable,
                   bool (U::*isEnabled)() const) {
    EXPECT_FAILURE(kRefusal, (unit.*enable)());
    EXPECT_FAILURE(kRefusal, EXPECT_TRUE((unit.*isEnabled)()));
    EXPECT_TRUE(IsCoreRun() || ::glIsEnabled(target));
    EXPECT_FAILURE(kRefusal, (unit.*disable)());
    EXPECT_TRUE(IsCoreRun() || !::glIsEnabled(target));
}

} // namespace

class TextureUnitTest : public ObjectTest {};

TEST_F(TextureUnitTest, ActsOnTheActiveUnit) {
    TextureState::SetActiveTextureUnit(3);
    EXPECT_EQ(3u, TextureState::ActiveTextureUnit());
    EXPECT_EQ(GL_TEXTURE3, Get(GL_ACTIVE_TEXTURE));
    U const &unit = *U::Unit(3);
    ExpectBinds(unit, Texture1D(kRGBA8, 4, false), &U::bind1DDefault);
    ExpectBinds(unit, Texture2D(kRGBA8, 4, 4, false), &U::bind2DDefault);
    ExpectBinds(unit, TextureRECT(kRGBA8, 4, 4), &U::bindRECTDefault);
    ExpectBinds(unit, Texture3D(kRGBA8, 4, 4, 4, false), &U::bind3DDefault);
    ExpectBinds(unit, Texture2DArray(kRGBA8, 4, 4, 4, false), &U::bind2DArrayDefault);
    ExpectEnables(unit, GL_TEXTURE_1D, &U::enable1D, &U::disable1D, &U::isEnabled1D);
    ExpectEnables(unit, GL_TEXTURE_2D, &U::enable2D, &U::disable2D, &U::isEnabled2D);
    ExpectEnables(unit, GL_TEXTURE_RECTANGLE, &U::enableRECT, &U::disableRECT, &U::isEnabledRECT);
    ExpectEnables(unit, GL_TEXTURE_3D, &U::enable3D, &U::disable3D, &U::isEnabled3D);
    EXPECT_FAILURE(kRefusal, unit.setEnv(U::ENVIRONMENT_ADD));
    EXPECT_FAILURE("GL_INVALID_ENUM", TextureState::SetActiveTextureUnit(1000));
    ExpectTranslation("Environment", U::Environment2GL, U::GL2Environment, 6, GL_REPLACE);
}

TEST_F(TextureUnitTest, ScopeLeavesTheUnitEmptyAndTheOtherActive) {
    BoundTexture const texture(std::make_unique<Texture2D>(kRGBA8, 4, 4, false));
    auto &plane = dynamic_cast<Texture2D &>(*texture);
    plane.setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
    plane.setWrap(Texture::WRAPMODE_REPEAT, Texture::WRAPMODE_REPEAT);
    U::Unit(0)->bind2DDefault();
    TextureState::SetActiveTextureUnit(2);
    {
        Texture2DBindScope const scope(&plane, 0, true);
        EXPECT_EQ(0u, TextureState::ActiveTextureUnit());
        EXPECT_TRUE(plane.isBound());
        EXPECT_TRUE(IsCoreRun() || U::Unit(0)->isEnabled2D());
    }
    EXPECT_EQ(2u, TextureState::ActiveTextureUnit());
    // Inactive, or without a texture, or on a unit that there is not: the active one stays.
    Texture2DBindScope const inactive(nullptr, 3, false);
    EXPECT_FAILURE("theTexture", Texture2DBindScope const scope(nullptr, 3, true));
    EXPECT_FAILURE("GL_INVALID_ENUM", Texture2DBindScope const scope(&plane, 1000, true));
    EXPECT_EQ(2u, TextureState::ActiveTextureUnit());

    TextureState::SetActiveTextureUnit(0);
    EXPECT_EQ(0u, plane.getBoundID());
    EXPECT_TRUE(IsCoreRun() || !U::Unit(0)->isEnabled2D());
    texture.bind();
    EXPECT_EQ((std::vector<GLint>{GL_NEAREST, GL_NEAREST, GL_CLAMP_TO_EDGE, GL_CLAMP_TO_EDGE}),
              Sampling(GL_TEXTURE_2D, 2));
}
