// One stage of a GLSL program: its source and its compilation.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ogl/ogl/ownershiptag.h"

#include <string>

namespace ORU::OGL {

class ShaderImpl;

/// A shader object: load a source, compile it, attach it to a Program.
///
/// Made, used and destroyed while its context, or one that shares with it, is current. It owns its
/// OpenGL shader and moves; every member of a moved-from shader throws InternalException.
class ORU_API Shader {
public:
    enum ShaderType {
        SHADERTYPE_FRAGMENT = 0,
        SHADERTYPE_VERTEX = 1,
        SHADERTYPE_TESSELLATION_CONTROL = 2,
        SHADERTYPE_TESSELLATION_EVALUATION = 3,
        SHADERTYPE_GEOMETRY = 4,
        SHADERTYPE_COMPUTE = 5 ///< known by name, supported nowhere
    };

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
    void load(std::string const &source);

    /// Whether there is a source that is not empty. @note glGetShaderiv
    bool isLoaded() const;

    /// @param throwOnFailure whether a failed compilation throws rather than waits to be asked for
    /// @throws InternalException whose message holds the compiler's log
    /// @note glCompileShader
    void compile(bool throwOnFailure);

    /// Whether the last compilation succeeded. @note glGetShaderiv
    bool isCompiled() const;

    /// Bytes of the compiler's log with its final zero; 0 when there is none.
    /// @note glGetShaderiv
    int getInfoLogLength() const;

    /// @param maxLength bytes of the buffer
    /// @param buffer receives the log, cut to fit, and a final zero
    /// @note glGetShaderInfoLog
    void getInfoLog(int maxLength, char *buffer);

private:
    friend class ProgramImplCore;

    ShaderImpl &body() const;

    ScopedPtr<ShaderImpl> actualShader_;
};

// A class per type; their constructors throw as Shader's does.

class ORU_API FragmentShader : public Shader {
public:
    FragmentShader() : Shader(SHADERTYPE_FRAGMENT) {}
};

class ORU_API VertexShader : public Shader {
public:
    VertexShader() : Shader(SHADERTYPE_VERTEX) {}
};

class ORU_API TessellationControlShader : public Shader {
public:
    TessellationControlShader() : Shader(SHADERTYPE_TESSELLATION_CONTROL) {}
};

class ORU_API TessellationEvaluationShader : public Shader {
public:
    TessellationEvaluationShader() : Shader(SHADERTYPE_TESSELLATION_EVALUATION) {}
};

class ORU_API GeometryShader : public Shader {
public:
    GeometryShader() : Shader(SHADERTYPE_GEOMETRY) {}
};

/// Always throws: no context supports compute shaders here.
class ORU_API ComputeShader : public Shader {
public:
    ComputeShader() : Shader(SHADERTYPE_COMPUTE) {}
};

} // namespace ORU::OGL
