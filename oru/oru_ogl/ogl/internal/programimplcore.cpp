// The program body that drives the entry points of OpenGL 2.0.
#include "oru/oru_ogl/ogl/internal/programimplcore.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/programs/infolog.h"
#include "oru/oru_ogl/ogl/internal/shaderimplcore.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

/// The shaders attached to a program, as many as fit.
class AttachedShaders {
public:
    explicit AttachedShaders(GLuint program) {
        ORU_GL(GetAttachedShaders, program, kCapacity, &count_, shaders_);
    }

    bool empty() const { return count_ < 1; }
    GLuint const *begin() const { return shaders_; }
    GLuint const *end() const { return shaders_ + count_; }

private:
    static constexpr GLsizei kCapacity = 64;

    GLsizei count_ = 0;
    GLuint shaders_[kCapacity] = {};
};

} // namespace

ProgramImpl::~ProgramImpl() = default;

ProgramImplCore::ProgramImplCore() {
    ORU_ASSERT(IsSupported());
    programID_ = ORU_GL0(CreateProgram);
    ORU_ASSERT(programID_ != 0);
}

ProgramImplCore::ProgramImplCore(unsigned int name, ownership_tag ownership)
    : programID_(name), isOwner_(false) {
    internal::RequireName(ORU_GL(IsProgram, name), name, "program");
    isOwner_ = ownership.isOwner;
}

ProgramImplCore::~ProgramImplCore() {
    if (!isOwner_)
        return;
    internal::Release([this] {
        ORU_ASSERT(programID_ != 0);
        ORU_GL(DeleteProgram, programID_);
    });
}

unsigned int ProgramImplCore::disown() noexcept {
    isOwner_ = false;
    return programID_;
}

bool ProgramImplCore::IsSupported() {
    return internal::Supports(GL_VERSION_2_0);
}

int ProgramImplCore::parameter(unsigned int name) const {
    GLint value = 0;
    ORU_GL(GetProgramiv, programID_, name, &value);
    return value;
}

void ProgramImplCore::requireEnabled() const {
    if (!isEnabled())
        ORU_THROW_INTERNAL("Program must be enabled to set uniform parameter");
}

void ProgramImplCore::requireLinkedForQuery() const {
    if (!isLinked())
        ORU_THROW_INTERNAL("Program must be linked to get active uniform count");
}

void ProgramImplCore::attach(Shader *shader) {
    auto const *coreShader =
        shader ? dynamic_cast<ShaderImplCore const *>(shader->actualShader_.get()) : nullptr;
    ORU_ENFORCE_TEXT("coreShader != NULL", coreShader);
    if (!shader->isLoaded())
        ORU_THROW_INTERNAL("Shader must be loaded before attaching");
    ORU_GL(AttachShader, programID_, coreShader->shaderID());
}

void ProgramImplCore::detach(Shader const *shader) {
    auto const *coreShader =
        shader ? dynamic_cast<ShaderImplCore const *>(shader->actualShader_.get()) : nullptr;
    ORU_ENFORCE_TEXT("coreShader != NULL", coreShader);
    ORU_GL(DetachShader, programID_, coreShader->shaderID());
}

void ProgramImplCore::loadVertexShader(unsigned int count, char const *const *strings,
                                       int const *lengths) {
    loadShader(Shader::SHADERTYPE_VERTEX, count, strings, lengths);
}

void ProgramImplCore::loadFragmentShader(unsigned int count, char const *const *strings,
                                         int const *lengths) {
    loadShader(Shader::SHADERTYPE_FRAGMENT, count, strings, lengths);
}

void ProgramImplCore::loadShader(Shader::ShaderType type, unsigned int count,
                                 char const *const *strings, int const *lengths) {
    auto const shader = MakeScoped(ORU_NEW Shader(type));
    shader->load(count, strings, lengths);
    shader->compile(false); // a failure shows at link time
    attach(shader.get());
}

void ProgramImplCore::detachAllVertexShaders() {
    detachAllOfType(GL_VERTEX_SHADER);
}

void ProgramImplCore::detachAllFragmentShaders() {
    detachAllOfType(GL_FRAGMENT_SHADER);
}

void ProgramImplCore::detachAllOfType(unsigned int shaderType) {
    // Shaders of other types stay in the list, so it never gets empty: hence a limit.
    for (int pass = 0; pass < 4; ++pass) {
        AttachedShaders const shaders(programID_);
        if (shaders.empty())
            return;
        for (GLuint const shader : shaders) {
            GLint type = 0;
            ORU_GL(GetShaderiv, shader, GL_SHADER_TYPE, &type);
            if (static_cast<unsigned int>(type) == shaderType)
                ORU_GL(DetachShader, programID_, shader);
        }
    }
}

void ProgramImplCore::detachAllShaders() {
    for (;;) {
        AttachedShaders const shaders(programID_);
        if (shaders.empty())
            return;
        for (GLuint const shader : shaders)
            ORU_GL(DetachShader, programID_, shader);
    }
}

void ProgramImplCore::link(bool throwOnFailure) {
    ORU_GL(LinkProgram, programID_);
    if (!throwOnFailure)
        return;
    bool const linked = isLinked();
    int const length = getInfoLogLength();
    if (length < 2) {
        ORU_ASSERT_NOTED("Unknown Program Link Error\n", compileLogs(), linked);
        return;
    }
    std::string const log = internal::ReadInfoLog(*this, length);
    ORU_ASSERT_NOTED("Program Link Error: \n" + log, compileLogs(), linked);
    // Some drivers tell only in this way that the program is too much for the hardware.
    if (log.find("run in software") != std::string::npos)
        ORU_THROW_INTERNAL("Program Link Error(Falling to Software): \n" + log);
}

std::string ProgramImplCore::compileLogs() const {
    std::string logs;
    for (GLuint const shader : AttachedShaders(programID_)) {
        GLint compiled = GL_TRUE;
        ORU_GL(GetShaderiv, shader, GL_COMPILE_STATUS, &compiled);
        if (compiled)
            continue;
        GLint type = 0;
        ORU_GL(GetShaderiv, shader, GL_SHADER_TYPE, &type);
        GLint length = 0;
        ORU_GL(GetShaderiv, shader, GL_INFO_LOG_LENGTH, &length);
        std::string log(static_cast<std::string::size_type>(length), '\0');
        ORU_GL(GetShaderInfoLog, shader, length, &length, log.data());
        log.resize(static_cast<std::string::size_type>(length));
        logs += ORUOGLTokenName(static_cast<GLenum>(type)) + (" does not compile: " + log);
    }
    return logs;
}

void ProgramImplCore::postLinkInit() {}

bool ProgramImplCore::isLinked() const {
    return parameter(GL_LINK_STATUS) != GL_FALSE;
}

bool ProgramImplCore::validate() const {
    ORU_GL(ValidateProgram, programID_);
    return parameter(GL_VALIDATE_STATUS) != GL_FALSE;
}

void ProgramImplCore::enable() {
    if (!isLinked())
        ORU_THROW_INTERNAL("Program must be linked before being enabled");
    ORU_GL(UseProgram, programID_);
}

void ProgramImplCore::disable() {
    ORU_GL(UseProgram, 0);
}

bool ProgramImplCore::isEnabled() const {
    GLint current = 0;
    ORU_GL(GetIntegerv, GL_CURRENT_PROGRAM, &current);
    return static_cast<GLuint>(current) == programID_;
}

void ProgramImplCore::setAttributeLocation(unsigned int index, char const *name) {
    ORU_GL(BindAttribLocation, programID_, index, name);
}

int ProgramImplCore::getAttributeLocation(char const *name) {
    return ORU_GL(GetAttribLocation, programID_, name);
}

unsigned int ProgramImplCore::getActiveUniformCount() const {
    requireLinkedForQuery();
    return static_cast<unsigned int>(parameter(GL_ACTIVE_UNIFORMS));
}

int ProgramImplCore::getMaxUniformStringLength() const {
    requireLinkedForQuery();
    return parameter(GL_ACTIVE_UNIFORM_MAX_LENGTH);
}

void ProgramImplCore::getActiveUniform(unsigned int index, int bufSize, int *size,
                                       unsigned int *type, char *name) const {
    requireLinkedForQuery();
    GLsizei written = 0;
    ORU_GL(GetActiveUniform, programID_, index, bufSize, &written, size, type, name);
}

int ProgramImplCore::getUniformLocation(char const *name) const {
    return ORU_GL(GetUniformLocation, programID_, name);
}

// OpenGL itself reports a value of the wrong type.
void ProgramImplCore::assertActiveUniformType(int, unsigned int, unsigned int) const {}

int ProgramImplCore::getInfoLogLength() const {
    return parameter(GL_INFO_LOG_LENGTH);
}

void ProgramImplCore::getInfoLog(int maxLength, char *buffer) {
    GLsizei written = 0;
    ORU_GL(GetProgramInfoLog, programID_, maxLength, &written, buffer);
}

} // namespace ORU::OGL
