// Programs of single stages put together for drawing.
#pragma once

#include "oru/oru_ogl/ogl/object.h"

#include <string>

namespace ORU::OGL {

class Program;

/// A program pipeline object: which program each stage is taken from.
///
/// ```cpp
/// Program const vertices = Program::Separable(Shader::SHADERTYPE_VERTEX, vertexSource);
/// Program fragments = Program::Separable(Shader::SHADERTYPE_FRAGMENT, fragmentSource);
/// ProgramPipeline pipeline;
/// pipeline.useStages(ProgramPipeline::STAGE_VERTEX, vertices);
/// pipeline.useStages(ProgramPipeline::STAGE_FRAGMENT, fragments);
/// pipeline.bind();
/// pipeline.activate(fragments);
/// fragments.setUniform_Unsafe("gain", 0.5f);
/// ```
///
/// A program that is current, by `Program::enable` say, goes before the pipeline that is bound. The
/// guarded uniform setters ask for a current program and so refuse; those with `_Unsafe` set the
/// program that is active in the bound pipeline. The programs are to be kept alive. OpenGL 4.1, or
/// GL_ARB_separate_shader_objects.
class ORU_API ProgramPipeline : public Object {
public:
    /// Stages, to be joined by `|`; the values are OpenGL's.
    enum Stage : unsigned int {
        STAGE_VERTEX = 0x01,                  ///< GL_VERTEX_SHADER_BIT
        STAGE_FRAGMENT = 0x02,                ///< GL_FRAGMENT_SHADER_BIT
        STAGE_GEOMETRY = 0x04,                ///< GL_GEOMETRY_SHADER_BIT
        STAGE_TESSELLATION_CONTROL = 0x08,    ///< GL_TESS_CONTROL_SHADER_BIT
        STAGE_TESSELLATION_EVALUATION = 0x10, ///< GL_TESS_EVALUATION_SHADER_BIT
        STAGE_ALL = 0xFFFFFFFF                ///< GL_ALL_SHADER_BITS
    };

    /// Makes a pipeline without programs and does not bind it.
    /// @throws InternalException without `IsSupported()`
    /// @note glGenProgramPipelines
    ProgramPipeline();

    /// A pipeline that was made elsewhere. After a failure the name is the caller's as before.
    /// @throws InternalException without `IsSupported()`, and for a name that is no pipeline
    /// @note glIsProgramPipeline
    ProgramPipeline(unsigned int name, ownership_tag ownership);

    ProgramPipeline(ProgramPipeline &&other) noexcept = default;
    ProgramPipeline &operator=(ProgramPipeline &&other) noexcept;

    /// Deletes the pipeline that the object owns. @note glDeleteProgramPipelines
    ~ProgramPipeline() override;

    /// Draws by this pipeline wherever no program is current. @note glBindProgramPipeline
    void bind();

    /// Binds no pipeline. @note glBindProgramPipeline
    static void BindDefault();

    /// Takes stages from a program.
    /// @param stages some of Stage; those that the program lacks get empty
    /// @throws InternalException for a program that was not linked as a separable one
    /// @note glGetProgramiv, glUseProgramStages
    void useStages(unsigned int stages, Program const &program);

    /// Leaves stages empty. @note glUseProgramStages
    void clearStages(unsigned int stages);

    /// Makes a program the one whose uniforms are set while the pipeline is bound.
    /// @note glActiveShaderProgram
    void activate(Program const &program);

    /// Whether the pipeline can run in the current state.
    /// @note glValidateProgramPipeline, glGetProgramPipelineiv
    bool validate();

    /// What the last validation said. @note glGetProgramPipelineiv, glGetProgramPipelineInfoLog
    std::string infoLog() const;

    /// Whether the current context has pipelines; false without a context.
    static bool IsSupported();

private:
    void deleteObject() noexcept;
    int parameter(unsigned int name) const;
};

} // namespace ORU::OGL
