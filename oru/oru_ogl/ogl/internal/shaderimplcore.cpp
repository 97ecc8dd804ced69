// The shader body that drives the entry points of OpenGL 2.0.
#include "oru/oru_ogl/ogl/internal/shaderimplcore.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/objects/translation.h"
#include "oru/oru_ogl/ogl/internal/programs/infolog.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

#define ORU_SHADER(Type, GLType)                                                                   \
    { Shader::SHADERTYPE_##Type, GL_##GLType##_SHADER }
constexpr internal::Translation<Shader::ShaderType, 5> kTypes = {
    "Type enums are not all properly translated.", // unlike the other tables' texts: no literal
    {ORU_SHADER(FRAGMENT, FRAGMENT), ORU_SHADER(VERTEX, VERTEX),
     ORU_SHADER(TESSELLATION_CONTROL, TESS_CONTROL),
     ORU_SHADER(TESSELLATION_EVALUATION, TESS_EVALUATION), ORU_SHADER(GEOMETRY, GEOMETRY)}};
#undef ORU_SHADER
static_assert(kTypes.isInOrder());

} // namespace

ShaderImpl::~ShaderImpl() = default;

ShaderImplCore::ShaderImplCore(Shader::ShaderType type) {
    ORU_ASSERT_TEXT("IsSupported(eShaderType)", IsSupported(type));
    shaderID_ = ORU_GL(CreateShader, kTypes.toGL(type, __FILE__, __LINE__));
}

ShaderImplCore::ShaderImplCore(unsigned int name, ownership_tag ownership)
    : shaderID_(name), isOwner_(false) {
    internal::RequireName(ORU_GL(IsShader, name), name, "shader");
    isOwner_ = ownership.isOwner;
}

ShaderImplCore::~ShaderImplCore() {
    if (!isOwner_)
        return;
    internal::Release([this] {
        ORU_ASSERT(shaderID_ != 0);
        ORU_GL(DeleteShader, shaderID_);
    });
}

unsigned int ShaderImplCore::disown() noexcept {
    isOwner_ = false;
    return shaderID_;
}

bool ShaderImplCore::IsSupported(Shader::ShaderType type) {
    switch (type) {
    case Shader::SHADERTYPE_FRAGMENT:
    case Shader::SHADERTYPE_VERTEX:
        return internal::Supports(GL_VERSION_2_0);
    case Shader::SHADERTYPE_TESSELLATION_CONTROL:
    case Shader::SHADERTYPE_TESSELLATION_EVALUATION:
        return internal::Supports(GL_ARB_TESSELLATION_SHADER);
    case Shader::SHADERTYPE_GEOMETRY:
        return internal::Supports(GL_VERSION_3_2);
    case Shader::SHADERTYPE_COMPUTE:
        break;
    }
    return false;
}

int ShaderImplCore::parameter(unsigned int name) const {
    GLint value = 0;
    ORU_GL(GetShaderiv, shaderID_, name, &value);
    return value;
}

void ShaderImplCore::load(unsigned int count, char const *const *strings, int const *lengths) {
    ORU_GL(ShaderSource, shaderID_, static_cast<GLsizei>(count), strings, lengths);
}

void ShaderImplCore::load(std::string const &source) {
    char const *const text = source.data();
    GLint const length = static_cast<GLint>(source.size());
    ORU_GL(ShaderSource, shaderID_, 1, &text, &length);
}

bool ShaderImplCore::isLoaded() const {
    return parameter(GL_SHADER_SOURCE_LENGTH) > 1; // an empty source counts its final zero
}

void ShaderImplCore::compile(bool throwOnFailure) {
    ORU_GL(CompileShader, shaderID_);
    if (!throwOnFailure || isCompiled())
        return;
    int const length = getInfoLogLength();
    if (length == 0)
        ORU_THROW_INTERNAL("Unknown Compile Error.");
    // A shader's failure, which says "Program": the check's text is what hosts see.
    ORU_THROW_INTERNAL("Program Compile Error: \n" + internal::ReadInfoLog(*this, length));
}

bool ShaderImplCore::isCompiled() const {
    return parameter(GL_COMPILE_STATUS) != GL_FALSE;
}

int ShaderImplCore::getInfoLogLength() const {
    return parameter(GL_INFO_LOG_LENGTH);
}

void ShaderImplCore::getInfoLog(int maxLength, char *buffer) {
    GLsizei written = 0;
    ORU_GL(GetShaderInfoLog, shaderID_, maxLength, &written, buffer);
}

} // namespace ORU::OGL
