// GLSL programs and their uniforms.
#include "oru/oru_ogl/ogl/programogl.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/ogl/internal/programimplcore.h"

namespace ORU::OGL {

Program::Program() {
    if (!ProgramImplCore::IsSupported())
        ORU_THROW_INTERNAL("OpenGL shader programs must be supported");
    actualProgram_.reset(ORU_NEW ProgramImplCore);
    ORU_ENFORCE_TEXT("actualProgram_ != NULL", actualProgram_);
}

Program::Program(unsigned int name, ownership_tag ownership) {
    if (!ProgramImplCore::IsSupported())
        ORU_THROW_INTERNAL("OpenGL shader programs must be supported");
    actualProgram_.reset(ORU_NEW ProgramImplCore(name, ownership));
}

Program::Program(Program &&other) noexcept = default;
Program &Program::operator=(Program &&other) noexcept = default;
Program::~Program() = default;

bool Program::IsSupported() {
    return ProgramImplCore::IsSupported();
}

namespace {

/// Out of line, as `body` is inlined into every setter.
[[noreturn]] ORU_COLD void ThrowWithoutBody() {
    ORU_private::ThrowInternalNoted(__FILE__, __LINE__, "Enforce actualProgram_ != NULL",
                                    "the program is empty: it was moved from, or has given up its "
                                    "name");
}

} // namespace

ProgramImpl &Program::body() const {
    if (!actualProgram_)
        ThrowWithoutBody();
    return *actualProgram_;
}

unsigned int Program::programID() const {
    return body().programID();
}

unsigned int Program::disown() {
    unsigned int const name = body().disown();
    actualProgram_.reset();
    return name;
}

void Program::attach(Shader *shader) {
    body().attach(shader);
}

void Program::detach(Shader const *shader) {
    body().detach(shader);
}

void Program::detachAllShaders() {
    body().detachAllShaders();
}

void Program::detachAllVertexShaders() {
    body().detachAllVertexShaders();
}

void Program::detachAllFragmentShaders() {
    body().detachAllFragmentShaders();
}

void Program::loadVertexShader(unsigned int count, char const *const *strings, int const *lengths) {
    body().loadVertexShader(count, strings, lengths);
}

void Program::loadFragmentShader(unsigned int count, char const *const *strings,
                                 int const *lengths) {
    body().loadFragmentShader(count, strings, lengths);
}

void Program::link(bool throwOnFailure) {
    body().link(throwOnFailure);
}

void Program::postLinkInit() {
    body().postLinkInit();
}

bool Program::isLinked() const {
    return body().isLinked();
}

bool Program::validate() const {
    return body().validate();
}

void Program::enable() {
    body().enable();
}

void Program::disable() {
    body().disable();
}

bool Program::isEnabled() const {
    return body().isEnabled();
}

int Program::getInfoLogLength() const {
    return body().getInfoLogLength();
}

void Program::getInfoLog(int maxLength, char *buffer) {
    body().getInfoLog(maxLength, buffer);
}

std::string Program::compileLogs() const {
    return body().compileLogs();
}

void Program::setAttributeLocation(unsigned int index, char const *name) {
    body().setAttributeLocation(index, name);
}

int Program::getAttributeLocation(char const *name) {
    return body().getAttributeLocation(name);
}

unsigned int Program::getActiveUniformCount() const {
    return body().getActiveUniformCount();
}

int Program::getMaxUniformStringLength() const {
    return body().getMaxUniformStringLength();
}

void Program::getActiveUniform(unsigned int index, int bufSize, int *size, unsigned int *type,
                               char *name) const {
    body().getActiveUniform(index, bufSize, size, type, name);
}

int Program::getUniformLocation(char const *name) const {
    return body().getUniformLocation(name);
}

void Program::assertActiveUniformType(int location, unsigned int glType, unsigned int count) const {
    body().assertActiveUniformType(location, glType, count);
}

#define ORU_UNIFORM_OPERATION(Name, Parameters, Arguments)                                         \
    void Program::Name Parameters {                                                                \
        body().Name Arguments;                                                                     \
    }
#include "oru/oru_ogl/ogl/uniformoperations.inc"

} // namespace ORU::OGL
