// The shader body that drives the entry points of OpenGL 2.0.
#pragma once

#include "oru/oru_ogl/ogl/internal/programs/shaderimpl.h"
#include "oru/oru_ogl/ogl/shader.h"

namespace ORU::OGL {

/// A body that owns one OpenGL shader object.
class ORU_API ShaderImplCore : public ShaderImpl {
public:
    explicit ShaderImplCore(Shader::ShaderType type);

    /// Over a shader that was made elsewhere.
    /// @throws InternalException for a name that is no shader
    ShaderImplCore(unsigned int name, ownership_tag ownership);
    ~ShaderImplCore() override;

    static bool IsSupported(Shader::ShaderType type);

    void compile(bool throwOnFailure) override;
    void getInfoLog(int maxLength, char *buffer) override;
    int getInfoLogLength() const override;
    bool isCompiled() const override;
    bool isLoaded() const override;
    void load(std::string const &source) override;
    void load(unsigned int count, char const *const *strings, int const *lengths) override;

    unsigned int shaderID() const override { return shaderID_; }
    unsigned int disown() noexcept override;

private:
    int parameter(unsigned int name) const;

    unsigned int shaderID_ = 0;
    bool isOwner_ = true;
};

} // namespace ORU::OGL
