// The fixed-function texture units of the current context.
#include "oru/oru_ogl/ogl/textureunit.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/translation.h"
#include "oru/oru_ogl/ogl/texture1.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

#define ORU_ROW(Name)                                                                              \
    { TextureUnit::ENVIRONMENT_##Name, GL_##Name }
constexpr internal::Translation<TextureUnit::Environment, 6> kEnvironments = {
    ORU_TRANSLATION_FAILURE("Environment enums are not all properly translated."),
    {ORU_ROW(ADD), ORU_ROW(BLEND), ORU_ROW(COMBINE), ORU_ROW(DECAL), ORU_ROW(MODULATE),
     ORU_ROW(REPLACE)}};
#undef ORU_ROW

void RequireFixedFunction() {
    ORU_ASSERT_TEXT(
        "Fixed-function texturing needs a compatibility context: in a core one bind the "
        "texture and sample it in a shader",
        !internal::IsCoreContext());
}

} // namespace

// More than any implementation has units.
TextureUnit TextureUnit::sUnits_[256];

TextureUnit *TextureUnit::Unit(unsigned int index) {
    return &sUnits_[index];
}

void TextureUnit::bind(unsigned int target, unsigned int name) const {
    ORU_GL(BindTexture, target, name);
}

void TextureUnit::bind(Texture const *texture) const {
    ORU_GL(BindTexture, texture->target(), texture->checkedID());
}

// One row per target: its name here, its GL target and the class that is bound to it.
#define ORU_BINDING(Target, gl, Class)                                                             \
    void TextureUnit::bind(Class const *texture) const {                                           \
        ORU_GL(BindTexture, gl, texture->checkedID());                                             \
    }                                                                                              \
    void TextureUnit::bind##Target##Default() const {                                              \
        ORU_GL(BindTexture, gl, 0);                                                                \
    }
ORU_BINDING(1D, GL_TEXTURE_1D, Texture1D)
ORU_BINDING(2D, GL_TEXTURE_2D, Texture2D)
ORU_BINDING(3D, GL_TEXTURE_3D, Texture3D)
ORU_BINDING(2DArray, GL_TEXTURE_2D_ARRAY, Texture2DArray)
ORU_BINDING(RECT, GL_TEXTURE_RECTANGLE, TextureRECT)
#undef ORU_BINDING

#define ORU_ENABLING(Target, gl)                                                                   \
    void TextureUnit::enable##Target() const {                                                     \
        RequireFixedFunction();                                                                    \
        ORU_GL(Enable, gl);                                                                        \
    }                                                                                              \
    void TextureUnit::disable##Target() const {                                                    \
        RequireFixedFunction();                                                                    \
        ORU_GL(Disable, gl);                                                                       \
    }                                                                                              \
    bool TextureUnit::isEnabled##Target() const {                                                  \
        RequireFixedFunction();                                                                    \
        return ORU_GL(IsEnabled, gl) == GL_TRUE;                                                   \
    }
ORU_ENABLING(1D, GL_TEXTURE_1D)
ORU_ENABLING(2D, GL_TEXTURE_2D)
ORU_ENABLING(3D, GL_TEXTURE_3D)
ORU_ENABLING(RECT, GL_TEXTURE_RECTANGLE)
#undef ORU_ENABLING

void TextureUnit::setEnv(Environment environment) const {
    RequireFixedFunction();
    ORU_GL(TexEnvi, GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE,
           static_cast<GLint>(Environment2GL(environment)));
}

ORU_TRANSLATED(TextureUnit, Environment, kEnvironments)

bool TextureUnit::verifyActiveTexture() const {
    return TextureState::ActiveTextureUnit() == static_cast<unsigned int>(this - sUnits_);
}

} // namespace ORU::OGL
