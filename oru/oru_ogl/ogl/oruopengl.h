// Helpers for hosts that keep OpenGL program names of their own.
#pragma once

#include "oru/core/utility/export.h"

#include <string>

namespace ORU::OGL {

/// @name Programs by their OpenGL name
/// They check nothing themselves: a misuse is an OpenGL error, which the interceptor chain reports.
/// A name that the program does not have is ignored. OpenGL 2.0.
/// @{

/// Makes a program current. @note glUseProgram
ORU_API void Enable(unsigned int program);

/// Makes no program current, whatever `program` is. @note glUseProgram
ORU_API void Disable(unsigned int program);

// The program whose uniform is set must be current.

/// @note glGetUniformLocation, glUniform1i
ORU_API void SetUniformBool(unsigned int program, char const *name, bool value);

/// @note glGetUniformLocation, glUniform4f
ORU_API void SetUniformFloat4(unsigned int program, char const *name, float x, float y, float z,
                              float w);

/// @param matrix 16 numbers, column after column unless `transpose` is set
/// @note glGetUniformLocation, glUniformMatrix4fv
ORU_API void SetUniformMatrix4(unsigned int program, char const *name, float const *matrix,
                               bool transpose);

/// @param unit index of the texture unit that the sampler reads
/// @note glGetUniformLocation, glUniform1i
ORU_API void SetUniformSampler2D(unsigned int program, char const *name, unsigned int unit);
/// @}

/// A text of the current context: GL_VENDOR, GL_VERSION and the like.
/// @return empty without a current context, or when OpenGL knows no such text
/// @note glGetString, past the interceptor chain
ORU_API std::string GetGLString(unsigned int name);

} // namespace ORU::OGL
