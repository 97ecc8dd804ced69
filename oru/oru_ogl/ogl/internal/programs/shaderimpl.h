// What a shader handle asks of its body.
#pragma once

#include "oru/core/utility/export.h"

#include <string>

namespace ORU::OGL {

/// The body of a Shader; each operation is documented at the handle's of the same name.
class ORU_API ShaderImpl {
public:
    ShaderImpl() = default;
    ShaderImpl(ShaderImpl const &) = delete;
    ShaderImpl &operator=(ShaderImpl const &) = delete;
    virtual ~ShaderImpl();

    virtual void compile(bool throwOnFailure) = 0;
    virtual void getInfoLog(int maxLength, char *buffer) = 0;
    virtual int getInfoLogLength() const = 0;
    virtual bool isCompiled() const = 0;
    virtual bool isLoaded() const = 0;
    virtual void load(std::string const &source) = 0;
    virtual void load(unsigned int count, char const *const *strings, int const *lengths) = 0;
    virtual unsigned int shaderID() const = 0;

    /// @return the name, which the body deletes no more
    virtual unsigned int disown() noexcept = 0;
};

} // namespace ORU::OGL
