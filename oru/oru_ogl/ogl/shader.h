// One stage of a GLSL program: its source and its compilation.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ogl/ogl/ownershiptag.h"

#include <string>
#include <string_view>

namespace ORU::OGL {

class ShaderImpl;

/// A shader object: load a source, compile it, attach it to a Program.
///
/// Made, used and destroyed while its context, or one that shares with it, is current. It owns its
/// OpenGL shader and moves; every member of a moved-from shader throws InternalException.
class ORU_API Shader {
public:
    /// The stage that the shader is for.
    enum ShaderType {
        SHADERTYPE_FRAGMENT = 0,                ///< GL_FRAGMENT_SHADER
        SHADERTYPE_VERTEX = 1,                  ///< GL_VERTEX_SHADER
        SHADERTYPE_TESSELLATION_CONTROL = 2,    ///< GL_TESS_CONTROL_SHADER
        SHADERTYPE_TESSELLATION_EVALUATION = 3, ///< GL_TESS_EVALUATION_SHADER
        SHADERTYPE_GEOMETRY = 4,                ///< GL_GEOMETRY_SHADER
        SHADERTYPE_COMPUTE = 5                  ///< known by name, supported nowhere
    };

    /// Makes a shader without a source.
    /// @throws InternalException when the current context does not support the type
    /// @note glCreateShader
    explicit Shader(ShaderType type);

    /// A shader that was made elsewhere. After a failure the name is the caller's as before.
    /// @throws InternalException before OpenGL 2.0, and for a name that is no shader
    /// @note glIsShader
    Shader(unsigned int name, ownership_tag ownership);

    Shader(Shader &&other) noexcept;
    Shader &operator=(Shader &&other) noexcept;
    /// Deletes the shader that the object owns.
    /// @note glDeleteShader; OpenGL keeps the shader while it is attached to a program
    ~Shader();

    /// The GL name.
    unsigned int shaderID() const;

    /// Gives up the shader, which is the caller's to delete now; this is as if moved from
    /// afterwards.
    /// @return its GL name
    unsigned int disown();

    /// Whether the current context has shaders of a type: fragment and vertex shaders with OpenGL
    /// 2.0, geometry shaders with 3.2, tessellation with GL_ARB_tessellation_shader.
    static bool IsSupported(ShaderType type);

    /// Replaces the source by the concatenation of several texts.
    /// @param lengths bytes of each text, a negative one for a text that ends with a zero; null
    ///        when all of them do
    /// @note glShaderSource
    void load(unsigned int count, char const *const *strings, int const *lengths);
    /// Replaces the source.
    /// @note glShaderSource
    void load(std::string const &source);

    /// Replaces the source by a text that need not end with a zero.
    /// @note glShaderSource
    void loadSource(std::string_view source);

    /// Whether there is a source that is not empty. @note glGetShaderiv
    bool isLoaded() const;

    /// Compiles the source.
    /// @param throwOnFailure whether a failed compilation throws rather than waits to be asked for
    /// @throws InternalException whose message holds the compiler's log
    /// @note glCompileShader
    void compile(bool throwOnFailure);

    /// Whether the last compilation succeeded. @note glGetShaderiv
    bool isCompiled() const;

    /// Bytes of the compiler's log with its final zero; 0 when there is none.
    /// @note glGetShaderiv
    int getInfoLogLength() const;

    /// What the compiler said.
    /// @param maxLength bytes of the buffer
    /// @param buffer receives the log, cut to fit, and a final zero
    /// @note glGetShaderInfoLog
    void getInfoLog(int maxLength, char *buffer);

private:
    friend class ProgramImplCore;

    ShaderImpl &body() const;

    ScopedPtr<ShaderImpl> actualShader_;
};

/// Computes the colour of each fragment. OpenGL 2.0.
class ORU_API FragmentShader : public Shader {
public:
    /// Makes a shader without a source.
    /// @throws InternalException as Shader's constructor
    FragmentShader() : Shader(SHADERTYPE_FRAGMENT) {}
};

/// Computes the place of each vertex. OpenGL 2.0.
class ORU_API VertexShader : public Shader {
public:
    /// Makes a shader without a source.
    /// @throws InternalException as Shader's constructor
    VertexShader() : Shader(SHADERTYPE_VERTEX) {}
};

/// Says how finely a patch is divided. GL_ARB_tessellation_shader.
class ORU_API TessellationControlShader : public Shader {
public:
    /// Makes a shader without a source.
    /// @throws InternalException as Shader's constructor
    TessellationControlShader() : Shader(SHADERTYPE_TESSELLATION_CONTROL) {}
};

/// Computes the vertices of a divided patch. GL_ARB_tessellation_shader.
class ORU_API TessellationEvaluationShader : public Shader {
public:
    /// Makes a shader without a source.
    /// @throws InternalException as Shader's constructor
    TessellationEvaluationShader() : Shader(SHADERTYPE_TESSELLATION_EVALUATION) {}
};

/// Makes primitives of a primitive. OpenGL 3.2.
class ORU_API GeometryShader : public Shader {
public:
    /// Makes a shader without a source.
    /// @throws InternalException as Shader's constructor
    GeometryShader() : Shader(SHADERTYPE_GEOMETRY) {}
};

/// Always throws: no context supports compute shaders here.
class ORU_API ComputeShader : public Shader {
public:
    /// There is none to be made.
    /// @throws InternalException always
    ComputeShader() : Shader(SHADERTYPE_COMPUTE) {}
};

} // namespace ORU::OGL
