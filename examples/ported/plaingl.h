// What a host with plain calls has: OpenGL's functions by their addresses, a check for errors, and
// a helper that makes programs.
#pragma once

#include "oru/oru_ogl/platformgl.h"

#include <stdexcept>
#include <string>
#include <utility>

// clang-format off
#define PLAIN_FUNCTIONS(Do) \
    Do(PFNGLACTIVETEXTUREPROC, glActiveTexture) \
    Do(PFNGLATTACHSHADERPROC, glAttachShader) \
    Do(PFNGLBEGINCONDITIONALRENDERPROC, glBeginConditionalRender) \
    Do(PFNGLBEGINQUERYPROC, glBeginQuery) \
    Do(PFNGLBEGINTRANSFORMFEEDBACKPROC, glBeginTransformFeedback) \
    Do(PFNGLBINDBUFFERPROC, glBindBuffer) \
    Do(PFNGLBINDBUFFERBASEPROC, glBindBufferBase) \
    Do(PFNGLBINDBUFFERRANGEPROC, glBindBufferRange) \
    Do(PFNGLBINDFRAMEBUFFERPROC, glBindFramebuffer) \
    Do(PFNGLBINDRENDERBUFFERPROC, glBindRenderbuffer) \
    Do(PFNGLBINDSAMPLERPROC, glBindSampler) \
    Do(PFNGLBINDTRANSFORMFEEDBACKPROC, glBindTransformFeedback) \
    Do(PFNGLBINDVERTEXARRAYPROC, glBindVertexArray) \
    Do(PFNGLBLITFRAMEBUFFERPROC, glBlitFramebuffer) \
    Do(PFNGLBUFFERDATAPROC, glBufferData) \
    Do(PFNGLBUFFERSUBDATAPROC, glBufferSubData) \
    Do(PFNGLCHECKFRAMEBUFFERSTATUSPROC, glCheckFramebufferStatus) \
    Do(PFNGLCLIENTWAITSYNCPROC, glClientWaitSync) \
    Do(PFNGLCOMPILESHADERPROC, glCompileShader) \
    Do(PFNGLCREATEPROGRAMPROC, glCreateProgram) \
    Do(PFNGLCREATESHADERPROC, glCreateShader) \
    Do(PFNGLDELETEBUFFERSPROC, glDeleteBuffers) \
    Do(PFNGLDELETEFRAMEBUFFERSPROC, glDeleteFramebuffers) \
    Do(PFNGLDELETEPROGRAMPROC, glDeleteProgram) \
    Do(PFNGLDELETEQUERIESPROC, glDeleteQueries) \
    Do(PFNGLDELETERENDERBUFFERSPROC, glDeleteRenderbuffers) \
    Do(PFNGLDELETESAMPLERSPROC, glDeleteSamplers) \
    Do(PFNGLDELETESHADERPROC, glDeleteShader) \
    Do(PFNGLDELETESYNCPROC, glDeleteSync) \
    Do(PFNGLDELETETRANSFORMFEEDBACKSPROC, glDeleteTransformFeedbacks) \
    Do(PFNGLDELETEVERTEXARRAYSPROC, glDeleteVertexArrays) \
    Do(PFNGLDRAWARRAYSINSTANCEDPROC, glDrawArraysInstanced) \
    Do(PFNGLDRAWBUFFERSPROC, glDrawBuffers) \
    Do(PFNGLDRAWELEMENTSINSTANCEDPROC, glDrawElementsInstanced) \
    Do(PFNGLDRAWTRANSFORMFEEDBACKPROC, glDrawTransformFeedback) \
    Do(PFNGLENABLEVERTEXATTRIBARRAYPROC, glEnableVertexAttribArray) \
    Do(PFNGLENDCONDITIONALRENDERPROC, glEndConditionalRender) \
    Do(PFNGLENDQUERYPROC, glEndQuery) \
    Do(PFNGLENDTRANSFORMFEEDBACKPROC, glEndTransformFeedback) \
    Do(PFNGLFENCESYNCPROC, glFenceSync) \
    Do(PFNGLFRAMEBUFFERRENDERBUFFERPROC, glFramebufferRenderbuffer) \
    Do(PFNGLFRAMEBUFFERTEXTURE2DPROC, glFramebufferTexture2D) \
    Do(PFNGLGENBUFFERSPROC, glGenBuffers) \
    Do(PFNGLGENFRAMEBUFFERSPROC, glGenFramebuffers) \
    Do(PFNGLGENQUERIESPROC, glGenQueries) \
    Do(PFNGLGENRENDERBUFFERSPROC, glGenRenderbuffers) \
    Do(PFNGLGENSAMPLERSPROC, glGenSamplers) \
    Do(PFNGLGENTRANSFORMFEEDBACKSPROC, glGenTransformFeedbacks) \
    Do(PFNGLGENVERTEXARRAYSPROC, glGenVertexArrays) \
    Do(PFNGLGENERATEMIPMAPPROC, glGenerateMipmap) \
    Do(PFNGLGETACTIVEUNIFORMBLOCKIVPROC, glGetActiveUniformBlockiv) \
    Do(PFNGLGETPROGRAMINFOLOGPROC, glGetProgramInfoLog) \
    Do(PFNGLGETPROGRAMIVPROC, glGetProgramiv) \
    Do(PFNGLGETQUERYOBJECTUI64VPROC, glGetQueryObjectui64v) \
    Do(PFNGLGETSHADERINFOLOGPROC, glGetShaderInfoLog) \
    Do(PFNGLGETSHADERIVPROC, glGetShaderiv) \
    Do(PFNGLGETUNIFORMBLOCKINDEXPROC, glGetUniformBlockIndex) \
    Do(PFNGLGETUNIFORMLOCATIONPROC, glGetUniformLocation) \
    Do(PFNGLLINKPROGRAMPROC, glLinkProgram) \
    Do(PFNGLMAPBUFFERRANGEPROC, glMapBufferRange) \
    Do(PFNGLQUERYCOUNTERPROC, glQueryCounter) \
    Do(PFNGLRENDERBUFFERSTORAGEPROC, glRenderbufferStorage) \
    Do(PFNGLRENDERBUFFERSTORAGEMULTISAMPLEPROC, glRenderbufferStorageMultisample) \
    Do(PFNGLSAMPLERPARAMETERIPROC, glSamplerParameteri) \
    Do(PFNGLSHADERSOURCEPROC, glShaderSource) \
    Do(PFNGLTRANSFORMFEEDBACKVARYINGSPROC, glTransformFeedbackVaryings) \
    Do(PFNGLUNIFORM1FPROC, glUniform1f) \
    Do(PFNGLUNIFORM1IPROC, glUniform1i) \
    Do(PFNGLUNIFORM2FPROC, glUniform2f) \
    Do(PFNGLUNIFORM3FVPROC, glUniform3fv) \
    Do(PFNGLUNIFORM4FVPROC, glUniform4fv) \
    Do(PFNGLUNIFORMBLOCKBINDINGPROC, glUniformBlockBinding) \
    Do(PFNGLUNIFORMMATRIX4FVPROC, glUniformMatrix4fv) \
    Do(PFNGLUNMAPBUFFERPROC, glUnmapBuffer) \
    Do(PFNGLUSEPROGRAMPROC, glUseProgram) \
    Do(PFNGLVERTEXATTRIBDIVISORPROC, glVertexAttribDivisor) \
    Do(PFNGLVERTEXATTRIBPOINTERPROC, glVertexAttribPointer)
// clang-format on

#define PLAIN_DEFINE(Type, Name) inline Type Name = nullptr;
PLAIN_FUNCTIONS(PLAIN_DEFINE)
#undef PLAIN_DEFINE

namespace plain {

/// Finds the functions of the current context.
inline void LoadFunctions() {
#define PLAIN_LOAD(Type, Name)                                                                     \
    Name = reinterpret_cast<Type>(reinterpret_cast<void *>(::wglGetProcAddress(#Name)));           \
    if (!Name)                                                                                     \
        throw std::runtime_error("the driver has no function " #Name);
    PLAIN_FUNCTIONS(PLAIN_LOAD)
#undef PLAIN_LOAD
}

/// Asks whether one of the calls so far has failed.
inline void Check(char const *where) {
    if (GLenum const error = ::glGetError())
        throw std::runtime_error("OpenGL error " + std::to_string(error) + " in " + where);
}

/// Asks whether the bound framebuffer can be drawn into.
inline void CheckFramebuffer(char const *which) {
    Check(which);
    if (GLenum const status = glCheckFramebufferStatus(GL_FRAMEBUFFER);
        status != GL_FRAMEBUFFER_COMPLETE)
        throw std::runtime_error(std::string("incomplete framebuffer of ") + which + ": " +
                                 std::to_string(status));
}

/// A linked program.
/// @param fragment, geometry null for none
/// @param captured an output that transform feedback writes, or null
inline GLuint MakeProgram(char const *vertex, char const *fragment, char const *geometry = nullptr,
                          char const *captured = nullptr) {
    GLuint const program = glCreateProgram();
    char log[1024] = "";
    for (auto const &[type, source] :
         {std::pair(GL_VERTEX_SHADER, vertex), std::pair(GL_FRAGMENT_SHADER, fragment),
          std::pair(GL_GEOMETRY_SHADER, geometry)}) {
        if (!source)
            continue;
        GLuint const shader = glCreateShader(static_cast<GLenum>(type));
        glShaderSource(shader, 1, &source, nullptr);
        glCompileShader(shader);
        glAttachShader(program, shader);
        glDeleteShader(shader); // when the program goes
        GLint compiled = GL_FALSE;
        glGetShaderiv(shader, GL_COMPILE_STATUS, &compiled);
        if (!compiled) {
            glGetShaderInfoLog(shader, sizeof log, nullptr, log);
            throw std::runtime_error(log);
        }
    }
    if (captured)
        glTransformFeedbackVaryings(program, 1, &captured, GL_INTERLEAVED_ATTRIBS);
    glLinkProgram(program);
    GLint linked = GL_FALSE;
    glGetProgramiv(program, GL_LINK_STATUS, &linked);
    if (!linked) {
        glGetProgramInfoLog(program, sizeof log, nullptr, log);
        throw std::runtime_error(log);
    }
    Check("a program");
    return program;
}

} // namespace plain
