// One stage of a GLSL program: its source and its compilation.
#include "oru/oru_ogl/ogl/shader.h"

#include "oru/core/utility/composetext.h"
#include <limits>

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/ogl/internal/shaderimplcore.h"

namespace ORU::OGL {

Shader::Shader(ShaderType type) {
    if (!IsSupported(type))
        ORU_THROW_INTERNAL("Unsupported shader type");
    if (!ShaderImplCore::IsSupported(type))
        ORU_THROW_INTERNAL("Shader not supported by core OpenGL");
    actualShader_.reset(ORU_NEW ShaderImplCore(type));
}

Shader::Shader(unsigned int name, ownership_tag ownership) {
    if (!IsSupported(SHADERTYPE_VERTEX))
        ORU_THROW_INTERNAL("Shader not supported by core OpenGL");
    actualShader_.reset(ORU_NEW ShaderImplCore(name, ownership));
}

Shader::Shader(Shader &&other) noexcept = default;
Shader &Shader::operator=(Shader &&other) noexcept = default;
Shader::~Shader() = default;

bool Shader::IsSupported(ShaderType type) {
    return ShaderImplCore::IsSupported(type);
}

ShaderImpl &Shader::body() const {
    ORU_ASSERT_NOTED("Enforce actualShader_ != NULL",
                     "the shader is empty: it was moved from, or has given up its name",
                     actualShader_);
    return *actualShader_;
}

unsigned int Shader::shaderID() const {
    return body().shaderID();
}

unsigned int Shader::disown() {
    unsigned int const name = body().disown();
    actualShader_.reset();
    return name;
}

void Shader::load(unsigned int count, char const *const *strings, int const *lengths) {
    body().load(count, strings, lengths);
}

void Shader::load(std::string const &source) {
    body().load(source);
}

void Shader::loadSource(std::string_view source) {
    char const *const text = source.empty() ? "" : source.data();
    // OpenGL would take a length that wraps around to less than 0 for a text that ends with a zero.
    if (source.size() > static_cast<std::size_t>(std::numeric_limits<int>::max()))
        ORU_THROW_INTERNAL("A shader's source of ", source.size(),
                           " bytes is longer than OpenGL counts");
    int const length = static_cast<int>(source.size());
    load(1, &text, &length);
}

bool Shader::isLoaded() const {
    return body().isLoaded();
}

void Shader::compile(bool throwOnFailure) {
    body().compile(throwOnFailure);
}

bool Shader::isCompiled() const {
    return body().isCompiled();
}

int Shader::getInfoLogLength() const {
    return body().getInfoLogLength();
}

void Shader::getInfoLog(int maxLength, char *buffer) {
    body().getInfoLog(maxLength, buffer);
}

} // namespace ORU::OGL
