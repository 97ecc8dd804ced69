// The program body that drives the entry points of OpenGL 2.0.
#pragma once

#include "oru/oru_ogl/ogl/internal/programs/programimpl.h"
#include "oru/oru_ogl/ogl/shader.h"

namespace ORU::OGL {

/// A body that owns one OpenGL program object.
class ORU_API ProgramImplCore : public ProgramImpl {
public:
    ProgramImplCore();

    /// Over a program that was made elsewhere.
    /// @throws InternalException for a name that is no program
    ProgramImplCore(unsigned int name, ownership_tag ownership);
    ~ProgramImplCore() override;

    static bool IsSupported();

    void attach(Shader *shader) override;
    void loadVertexShader(unsigned int count, char const *const *strings,
                          int const *lengths) override;
    void loadFragmentShader(unsigned int count, char const *const *strings,
                            int const *lengths) override;
    void detach(Shader const *shader) override;
    void detachAllVertexShaders() override;
    void detachAllFragmentShaders() override;
    void detachAllShaders() override;

    void link(bool throwOnFailure) override;
    void postLinkInit() override;
    bool isLinked() const override;
    void enable() override;
    bool validate() const override;
    bool isEnabled() const override;
    void disable() override;

    void setAttributeLocation(unsigned int index, char const *name) override;
    int getAttributeLocation(char const *name) override;
    unsigned int getActiveUniformCount() const override;
    int getMaxUniformStringLength() const override;
    void getActiveUniform(unsigned int index, int bufSize, int *size, unsigned int *type,
                          char *name) const override;
    int getUniformLocation(char const *name) const override;

#define ORU_UNIFORM_OPERATION(Name, Parameters, Arguments) void Name Parameters override;
#include "oru/oru_ogl/ogl/uniformoperations.inc"

    void assertActiveUniformType(int location, unsigned int glType,
                                 unsigned int count) const override;
    int getInfoLogLength() const override;
    void getInfoLog(int maxLength, char *buffer) override;
    std::string compileLogs() const override;
    unsigned int programID() const override {
        return programID_;
    }
    unsigned int disown() noexcept override;

private:
    int parameter(unsigned int name) const;
    void requireEnabled() const;
    void requireLinkedForQuery() const;
    void loadShader(Shader::ShaderType type, unsigned int count, char const *const *strings,
                    int const *lengths);
    void detachAllOfType(unsigned int shaderType);

    unsigned int programID_ = 0;
    bool isOwner_ = true;
};

} // namespace ORU::OGL
