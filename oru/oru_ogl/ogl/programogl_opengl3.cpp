// What programs can do since OpenGL 3: more stages and outputs, binaries, parts of pipelines.
#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/objects/translation.h"
#include "oru/oru_ogl/ogl/internal/programs/programbinary.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/programpipeline.h"
#include "oru/oru_ogl/platformgl.h"

#include <utility>

namespace ORU::OGL {

namespace {

constexpr internal::Translation<Program::FeedbackMode, 2> kFeedbackModes = {
    ORU_TRANSLATION_FAILURE("FeedbackMode enums are not all properly translated."),
    {{Program::FEEDBACKMODE_INTERLEAVED, GL_INTERLEAVED_ATTRIBS},
     {Program::FEEDBACKMODE_SEPARATE, GL_SEPARATE_ATTRIBS}}};
static_assert(kFeedbackModes.isInOrder());

void RequireOutputs() {
    ORU_ASSERT_TEXT("Outputs of programs are chosen by OpenGL 3.0, which the current context is "
                    "not of: use gl_FragColor or gl_FragData",
                    internal::Supports(GL_VERSION_3_0));
}

void RequireBinaries() {
    ORU_ASSERT_TEXT("Programs have no binaries in the current context: ask "
                    "Program::SupportsBinaries first, and compile the sources",
                    Program::SupportsBinaries());
}

GLint Parameter(GLuint program, GLenum name) {
    GLint value = 0;
    ORU_GL(GetProgramiv, program, name, &value);
    return value;
}

} // namespace

void Program::loadShader(Shader::ShaderType type, std::string_view source) {
    Shader shader(type);
    shader.loadSource(source);
    shader.compile(false); // a failure shows at link time
    attach(&shader);
}

void Program::setFragmentOutputLocation(unsigned int color, char const *name) {
    RequireOutputs();
    ORU_GL(BindFragDataLocation, programID(), color, name);
}

int Program::getFragmentOutputLocation(char const *name) const {
    RequireOutputs();
    return ORU_GL(GetFragDataLocation, programID(), name);
}

void Program::setFeedbackVaryings(std::vector<std::string> const &names, FeedbackMode mode) {
    RequireOutputs();
    std::vector<char const *> texts;
    texts.reserve(names.size());
    for (std::string const &name : names)
        texts.push_back(name.c_str());
    ORU_GL(TransformFeedbackVaryings, programID(), static_cast<GLsizei>(texts.size()), texts.data(),
           kFeedbackModes.toGL(mode, __FILE__, __LINE__));
}

bool Program::SupportsBinaries() {
    if (!internal::Supports(GL_ARB_GET_PROGRAM_BINARY))
        return false;
    GLint formats = 0;
    ORU_GL(GetIntegerv, GL_NUM_PROGRAM_BINARY_FORMATS, &formats);
    return formats > 0;
}

void Program::setBinaryRetrievable(bool on) {
    RequireBinaries();
    ORU_GL(ProgramParameteri, programID(), GL_PROGRAM_BINARY_RETRIEVABLE_HINT, on ? 1 : 0);
}

std::vector<unsigned char> Program::saveBinary() const {
    RequireBinaries();
    if (!isLinked())
        ORU_THROW_INTERNAL("Program must be linked before its binary is saved");
    GLint const size = Parameter(programID(), GL_PROGRAM_BINARY_LENGTH);
    std::vector<unsigned char> code(static_cast<std::size_t>(size));
    GLsizei written = 0;
    GLenum format = 0;
    ORU_GL(GetProgramBinary, programID(), size, &written, &format, code.data());
    code.resize(static_cast<std::size_t>(written));
    return internal::PackProgram({format, code.data(), code.size()}, internal::DriverText());
}

bool Program::loadBinary(void const *bytes, std::size_t size) {
    unsigned int const name = programID();
    if (!SupportsBinaries())
        return false;
    auto const code = internal::UnpackProgram(bytes, size, internal::DriverText());
    if (!code)
        return false;
    ORU_GL(ProgramBinary, name, code->format, code->bytes, static_cast<GLsizei>(code->size));
    return isLinked();
}

void Program::setSeparable(bool on) {
    ORU_ASSERT_TEXT("Separable programs need OpenGL 4.1 or GL_ARB_separate_shader_objects: ask "
                    "ProgramPipeline::IsSupported first, and link all stages into one program",
                    ProgramPipeline::IsSupported());
    ORU_GL(ProgramParameteri, programID(), GL_PROGRAM_SEPARABLE, on ? 1 : 0);
}

Program Program::Separable(Shader::ShaderType type, std::string_view source) {
    Program program;
    program.setSeparable(true);
    program.loadShader(type, source);
    program.link(true);
    program.detachAllShaders();
    return program;
}

} // namespace ORU::OGL
