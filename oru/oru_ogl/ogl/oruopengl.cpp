// Helpers for hosts that keep OpenGL program names of their own.
#include "oru/oru_ogl/ogl/oruopengl.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

void Enable(unsigned int program) {
    ORU_GL(UseProgram, program);
}

void Disable(unsigned int) {
    ORU_GL(UseProgram, 0);
}

void SetUniformBool(unsigned int program, char const *name, bool value) {
    GLint const location = ORU_GL(GetUniformLocation, program, name);
    ORU_GL(Uniform1i, location, value ? 1 : 0);
}

void SetUniformFloat4(unsigned int program, char const *name, float x, float y, float z, float w) {
    GLint const location = ORU_GL(GetUniformLocation, program, name);
    ORU_GL(Uniform4f, location, x, y, z, w);
}

void SetUniformMatrix4(unsigned int program, char const *name, float const *matrix,
                       bool transpose) {
    GLint const location = ORU_GL(GetUniformLocation, program, name);
    ORU_GL(UniformMatrix4fv, location, 1, static_cast<GLboolean>(transpose), matrix);
}

void SetUniformSampler2D(unsigned int program, char const *name, unsigned int unit) {
    GLint const location = ORU_GL(GetUniformLocation, program, name);
    ORU_GL(Uniform1i, location, static_cast<GLint>(unit));
}

std::string GetGLString(unsigned int name) {
    GLubyte const *const text = ::glGetString(name);
    return text ? reinterpret_cast<char const *>(text) : "";
}

} // namespace ORU::OGL
