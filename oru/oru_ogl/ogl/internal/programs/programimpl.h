// What a program handle asks of its body.
#pragma once

#include "oru/core/utility/export.h"

#include <string>

namespace ORU::OGL {

class Shader;

/// The body of a Program; each operation is documented at the handle's of the same name.
class ORU_API ProgramImpl {
public:
    ProgramImpl() = default;
    ProgramImpl(ProgramImpl const &) = delete;
    ProgramImpl &operator=(ProgramImpl const &) = delete;
    virtual ~ProgramImpl();

    virtual void attach(Shader *shader) = 0;
    virtual void loadVertexShader(unsigned int count, char const *const *strings,
                                  int const *lengths) = 0;
    virtual void loadFragmentShader(unsigned int count, char const *const *strings,
                                    int const *lengths) = 0;
    virtual void detach(Shader const *shader) = 0;
    virtual void detachAllVertexShaders() = 0;
    virtual void detachAllFragmentShaders() = 0;
    virtual void detachAllShaders() = 0;

    virtual void link(bool throwOnFailure) = 0;
    virtual void postLinkInit() = 0;
    virtual bool isLinked() const = 0;
    virtual void enable() = 0;
    virtual bool validate() const = 0;
    virtual bool isEnabled() const = 0;
    virtual void disable() = 0;

    virtual void setAttributeLocation(unsigned int index, char const *name) = 0;
    virtual int getAttributeLocation(char const *name) = 0;
    virtual unsigned int getActiveUniformCount() const = 0;
    virtual int getMaxUniformStringLength() const = 0;
    virtual void getActiveUniform(unsigned int index, int bufSize, int *size, unsigned int *type,
                                  char *name) const = 0;
    virtual int getUniformLocation(char const *name) const = 0;

#define ORU_UNIFORM_OPERATION(Name, Parameters, Arguments) virtual void Name Parameters = 0;
#include "oru/oru_ogl/ogl/uniformoperations.inc"

    /// Called by the guarded setters before they upload; a body may verify there that the uniform
    /// has this GL type and this many elements.
    virtual void assertActiveUniformType(int location, unsigned int glType,
                                         unsigned int count) const = 0;
    virtual int getInfoLogLength() const = 0;
    virtual void getInfoLog(int maxLength, char *buffer) = 0;
    virtual std::string compileLogs() const = 0;
    virtual unsigned int programID() const = 0;

    /// @return the name, which the body deletes no more
    virtual unsigned int disown() noexcept = 0;
};

} // namespace ORU::OGL
