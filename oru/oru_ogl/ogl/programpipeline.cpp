// Programs of single stages put together for drawing.
#include "oru/oru_ogl/ogl/programpipeline.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/platformgl.h"

#include <utility>

namespace ORU::OGL {

namespace {

void RequirePipelines() {
    ORU_ASSERT_TEXT("Program pipelines need OpenGL 4.1 or GL_ARB_separate_shader_objects: ask "
                    "ProgramPipeline::IsSupported first",
                    ProgramPipeline::IsSupported());
}

} // namespace

ProgramPipeline::ProgramPipeline() : Object(GL_PROGRAM_PIPELINE, GL_PROGRAM_PIPELINE_BINDING) {
    RequirePipelines();
    try {
        ORU_GL(GenProgramPipelines, 1, &objectID_);
        ORU_ASSERT(objectID_ != 0);
    } catch (...) {
        deleteObject(); // an error that was pending before ends the call when the name is made
        throw;
    }
}

ProgramPipeline::ProgramPipeline(unsigned int name, ownership_tag ownership)
    : Object(GL_PROGRAM_PIPELINE, GL_PROGRAM_PIPELINE_BINDING, name, ownership) {
    RequirePipelines();
    internal::RequireName(ORU_GL(IsProgramPipeline, name), name, "program pipeline");
}

ProgramPipeline &ProgramPipeline::operator=(ProgramPipeline &&other) noexcept {
    if (this != &other) {
        deleteObject();
        Object::operator=(std::move(other));
    }
    return *this;
}

ProgramPipeline::~ProgramPipeline() {
    deleteObject();
}

void ProgramPipeline::deleteObject() noexcept {
    if (ownsName())
        internal::Release([this] { ORU_GL(DeleteProgramPipelines, 1, &objectID_); });
}

int ProgramPipeline::parameter(unsigned int name) const {
    GLint value = 0;
    ORU_GL(GetProgramPipelineiv, checkedID(), name, &value);
    return value;
}

void ProgramPipeline::bind() {
    ORU_GL(BindProgramPipeline, checkedID());
}

void ProgramPipeline::BindDefault() {
    ORU_GL(BindProgramPipeline, 0u);
}

void ProgramPipeline::useStages(unsigned int stages, Program const &program) {
    requireObject();
    GLint isSeparable = 0;
    ORU_GL(GetProgramiv, program.programID(), GL_PROGRAM_SEPARABLE, &isSeparable);
    ORU_ASSERT_TEXT("A program for a pipeline must be linked as a separable one: call "
                    "setSeparable(true) before link, or make it by Program::Separable",
                    isSeparable && program.isLinked());
    ORU_GL(UseProgramStages, objectID_, stages, program.programID());
}

void ProgramPipeline::clearStages(unsigned int stages) {
    ORU_GL(UseProgramStages, checkedID(), stages, 0u);
}

void ProgramPipeline::activate(Program const &program) {
    ORU_GL(ActiveShaderProgram, checkedID(), program.programID());
}

bool ProgramPipeline::validate() {
    ORU_GL(ValidateProgramPipeline, checkedID());
    return parameter(GL_VALIDATE_STATUS) != GL_FALSE;
}

std::string ProgramPipeline::infoLog() const {
    GLsizei length = parameter(GL_INFO_LOG_LENGTH);
    std::string log(static_cast<std::string::size_type>(length), '\0');
    if (length > 0)
        ORU_GL(GetProgramPipelineInfoLog, objectID_, length, &length, log.data());
    log.resize(static_cast<std::string::size_type>(length));
    return log;
}

bool ProgramPipeline::IsSupported() {
    return internal::Supports(GL_ARB_SEPARATE_SHADER_OBJECTS);
}

} // namespace ORU::OGL
