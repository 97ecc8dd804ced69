// GLSL programs and their uniforms.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ogl/ogl/ownershiptag.h"
#include "oru/oru_ogl/ogl/shader.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace ORU::OGL {

class ProgramImpl;

/// A program object: attach shaders, link, enable, set uniforms, draw.
///
/// ```cpp
/// Program program;
/// program.loadVertexShader(1, &vertexSource, nullptr);
/// program.loadFragmentShader(1, &fragmentSource, nullptr);
/// program.link(true);
/// program.enable();
/// program.setUniform("gain", 0.5f);
/// ```
///
/// Made, used and destroyed while its context, or one that shares with it, is current. It owns its
/// OpenGL program and moves; every member of a moved-from program throws InternalException. OpenGL
/// 2.0.
class ORU_API Program {
public:
    /// How transform feedback lays what it captures into buffers.
    enum FeedbackMode : unsigned int {
        FEEDBACKMODE_INTERLEAVED = 0, ///< GL_INTERLEAVED_ATTRIBS: vertex after vertex in one buffer
        FEEDBACKMODE_SEPARATE         ///< GL_SEPARATE_ATTRIBS: each varying in a buffer of its own
    };

    /// Makes a program without shaders.
    /// @throws InternalException when the current context has no programs
    /// @note glCreateProgram
    Program();

    /// A program that was made elsewhere. After a failure the name is the caller's as before.
    /// @throws InternalException also for a name that is no program
    /// @note glIsProgram
    Program(unsigned int name, ownership_tag ownership);

    Program(Program &&other) noexcept;
    Program &operator=(Program &&other) noexcept;
    /// Deletes the program that the object owns.
    /// @note glDeleteProgram; OpenGL keeps the program while it is current
    ~Program();

    /// The GL name.
    unsigned int programID() const;

    /// Gives up the program, which is the caller's to delete now; this is as if moved from
    /// afterwards.
    /// @return its GL name
    unsigned int disown();

    /// Whether the current context has programs: OpenGL 2.0.
    static bool IsSupported();

    /// @name Shaders
    /// @{

    /// Attaches a shader, compiled or not.
    /// @throws InternalException for a shader without a source
    /// @note glAttachShader
    void attach(Shader *shader);

    /// Detaches a shader; what is linked stays.
    /// @note glDetachShader
    void detach(Shader const *shader);

    /// Detaches every shader of whatever type.
    /// @note glGetAttachedShaders, glDetachShader
    void detachAllShaders();

    /// Detaches up to 256 shaders of the type. @note glGetAttachedShaders, glDetachShader
    void detachAllVertexShaders();
    void detachAllFragmentShaders(); ///< As for vertex shaders.

    /// Makes a shader from a source, compiles and attaches it. A failed compilation shows when the
    /// program is linked, and in `compileLogs`.
    /// @param count, strings, lengths as Shader::load
    void loadVertexShader(unsigned int count, char const *const *strings, int const *lengths);
    /// As `loadVertexShader`.
    void loadFragmentShader(unsigned int count, char const *const *strings, int const *lengths);

    /// The same for a shader of any stage, from a text that need not end with a zero.
    /// @throws InternalException for a stage that the current context does not have
    void loadShader(Shader::ShaderType type, std::string_view source);
    /// @}

    /// @name One text for each stage
    /// As `loadShader`. Tessellation needs GL_ARB_tessellation_shader, geometry OpenGL 3.2.
    /// @{
    void loadVertexShader(std::string_view source) {
        loadShader(Shader::SHADERTYPE_VERTEX, source);
    }
    void loadFragmentShader(std::string_view source) {
        loadShader(Shader::SHADERTYPE_FRAGMENT, source);
    }
    void loadGeometryShader(std::string_view source) {
        loadShader(Shader::SHADERTYPE_GEOMETRY, source);
    }
    void loadTessellationControlShader(std::string_view source) {
        loadShader(Shader::SHADERTYPE_TESSELLATION_CONTROL, source);
    }
    void loadTessellationEvaluationShader(std::string_view source) {
        loadShader(Shader::SHADERTYPE_TESSELLATION_EVALUATION, source);
    }
    /// @}

    /// @name Linking and use
    /// @{

    /// Links the attached shaders.
    /// @param throwOnFailure whether a failed link throws rather than waits to be asked for; then a
    ///        driver's note that the program will "run in software" throws too
    /// @throws InternalException whose message holds the linker's log, and whose note what
    ///         `compileLogs` says
    /// @note glLinkProgram
    void link(bool throwOnFailure);

    /// A hook for bodies with work to do after a link; this one has none, and `link` calls it not.
    void postLinkInit();

    /// Whether the last link succeeded. @note glGetProgramiv
    bool isLinked() const;

    /// Whether the program can run in the current state. @note glValidateProgram
    bool validate() const;

    /// Makes the program current.
    /// @throws InternalException when it is not linked
    /// @note glUseProgram
    void enable();

    /// Makes no program current, whichever was. @note glUseProgram
    void disable();

    /// Whether the program is current. @note glGetIntegerv
    bool isEnabled() const;

    /// Bytes of the linker's log with its final zero; 0 when there is none.
    /// @note glGetProgramiv
    int getInfoLogLength() const;

    /// What the linker said.
    /// @param maxLength bytes of the buffer
    /// @param buffer receives the log, cut to fit, and a final zero
    /// @note glGetProgramInfoLog
    void getInfoLog(int maxLength, char *buffer);

    /// What the compiler says of each attached shader that does not compile; empty when all do.
    /// @note glGetAttachedShaders, glGetShaderiv, glGetShaderInfoLog
    std::string compileLogs() const;
    /// @}

    /// @name Attributes
    /// @{

    /// Takes effect when the program is linked next. @note glBindAttribLocation
    void setAttributeLocation(unsigned int index, char const *name);

    /// Where the linked program takes an attribute.
    /// @return -1 when the linked program does not use the attribute
    /// @note glGetAttribLocation
    int getAttributeLocation(char const *name);
    /// @}

    /// @name What comes out, besides the window's colour
    /// @{

    /// Which colour buffer an output of the fragment shader goes to. Takes effect when the program
    /// is linked next.
    /// @param color index of the draw buffer
    /// @throws InternalException before OpenGL 3.0
    /// @note glBindFragDataLocation
    void setFragmentOutputLocation(unsigned int color, char const *name);

    /// Where an output of the linked program goes.
    /// @return -1 when the program has no such output
    /// @throws InternalException before OpenGL 3.0
    /// @note glGetFragDataLocation
    int getFragmentOutputLocation(char const *name) const;

    /// What transform feedback captures of each vertex, outputs of the last stage before the
    /// fragments. Takes effect when the program is linked next.
    /// @throws InternalException before OpenGL 3.0
    /// @note glTransformFeedbackVaryings
    void setFeedbackVaryings(std::vector<std::string> const &names, FeedbackMode mode);
    /// @}

    /// @name Binaries
    /// A linked program as bytes, so that the next start need not compile it. They are good for the
    /// driver that made them, in its version; a host keeps its sources for all others.
    ///
    /// ```cpp
    /// if (!program.loadBinary(bytes.data(), bytes.size())) {
    ///     … load the shaders, setBinaryRetrievable(true), link(true) …
    ///     bytes = program.saveBinary();
    /// }
    /// ```
    /// @{

    /// Whether the current context has binaries: OpenGL 4.1 or GL_ARB_get_program_binary, and a
    /// driver that makes some. @note glGetIntegerv
    static bool SupportsBinaries();

    /// Whether a binary is going to be asked for. Takes effect when the program is linked next.
    /// @throws InternalException without `SupportsBinaries()`
    /// @note glProgramParameteri
    void setBinaryRetrievable(bool on);

    /// The linked program, with what tells whose it is and whether it is whole.
    /// @throws InternalException without `SupportsBinaries()`, and when the program is not linked
    /// @note glGetProgramiv, glGetProgramBinary
    std::vector<unsigned char> saveBinary() const;

    /// Makes this the program that was saved, linked, its uniforms as after a link.
    /// @param bytes what `saveBinary` returned
    /// @param size how many there are
    /// @return false for what another driver or version made, for what is cut off or was changed,
    ///         and without `SupportsBinaries()`: then nothing has happened; also when the driver
    ///         does not take its own binary back, after which the program is not linked
    /// @note glProgramBinary, glGetProgramiv
    [[nodiscard]] bool loadBinary(void const *bytes, std::size_t size);
    /// @}

    /// @name Parts of a ProgramPipeline
    /// @{

    /// Whether the program can be a pipeline's. Takes effect when the program is linked next.
    /// @throws InternalException without `ProgramPipeline::IsSupported()`
    /// @note glProgramParameteri
    void setSeparable(bool on);

    /// A linked program of one stage for pipelines.
    /// @throws InternalException without `ProgramPipeline::IsSupported()`, and as `link`
    static Program Separable(Shader::ShaderType type, std::string_view source);
    /// @}

    /// @name Uniform queries
    /// @{

    /// How many uniforms the linked program uses.
    /// @throws InternalException when not linked
    /// @note glGetProgramiv
    unsigned int getActiveUniformCount() const;

    /// Bytes of the longest uniform's name with its final zero.
    /// @throws InternalException when not linked
    /// @note glGetProgramiv
    int getMaxUniformStringLength() const;

    /// What is known of a uniform.
    /// @param bufSize bytes of `name`
    /// @param size receives the number of array elements, 1 for others
    /// @param type receives the GL type
    /// @param name receives the name, cut to fit, and a final zero
    /// @throws InternalException when not linked
    /// @note glGetActiveUniform
    void getActiveUniform(unsigned int index, int bufSize, int *size, unsigned int *type,
                          char *name) const;

    /// Asks OpenGL each time; keep the answer for a uniform that is set often.
    /// @return -1 when the linked program does not use the uniform
    /// @note glGetUniformLocation
    int getUniformLocation(char const *name) const;

    /// Called by the guarded setters before they upload; verifies nothing, since OpenGL itself
    /// reports a wrong type.
    void assertActiveUniformType(int location, unsigned int glType, unsigned int count) const;
    /// @}

    /// @name Uniform setters
    /// Each takes the uniform as a location or as a name, which costs a query, then the values:
    ///
    /// | setter | values | GL call |
    /// |---|---|---|
    /// | `setUniform` | 1 to 4 of bool, unsigned char, int or float | glUniform{1,2,3,4}{i,f} |
    /// | `setUniform`, `…2`, `…3`, `…4` | a count, int or float array | glUniform{1,2,3,4}{i,f}v |
    /// | `setUniformSampler1D`, `…2D`, `…2DRECT`, `…3D` | a texture unit's index | glUniform1i |
    /// | `setUniformMatrix2`, `…3`, `…4` | n × n floats, transpose | glUniformMatrix{2,3,4}fv |
    /// | `setUniformMatrices2`, `…3`, `…4` | the same after a count | glUniformMatrix{2,3,4}fv |
    ///
    /// Matrices lie column after column unless transposed. A location of -1 is ignored.
    ///
    /// The plain form asks whether the program is current and throws InternalException when it is
    /// not (an array set by name is sent without asking). The form `…_Unsafe` takes that for
    /// granted and makes the GL call at once, none for a location of -1.
    /// @{
#define ORU_UNIFORM_OPERATION(Name, Parameters, Arguments) void Name Parameters;
#include "oru/oru_ogl/ogl/uniformoperations.inc"
    /// @}

private:
    ProgramImpl &body() const;

    ScopedPtr<ProgramImpl> actualProgram_;
};

} // namespace ORU::OGL
