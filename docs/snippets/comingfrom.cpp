// The code of the page for those who come from other OpenGL code.
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <vector>

namespace {

// What a function loader defines.
#define LOADER_FUNCTIONS(Do)                                                                       \
    Do(PFNGLATTACHSHADERPROC, glAttachShader) Do(PFNGLBINDBUFFERPROC, glBindBuffer) Do(            \
        PFNGLBINDFRAMEBUFFERPROC, glBindFramebuffer) Do(PFNGLBUFFERDATAPROC, glBufferData)         \
        Do(PFNGLCHECKFRAMEBUFFERSTATUSPROC, glCheckFramebufferStatus) Do(                          \
            PFNGLCOMPILESHADERPROC, glCompileShader) Do(PFNGLCREATEPROGRAMPROC, glCreateProgram)   \
            Do(PFNGLCREATESHADERPROC, glCreateShader) Do(PFNGLDELETEBUFFERSPROC, glDeleteBuffers)  \
                Do(PFNGLDELETEFRAMEBUFFERSPROC, glDeleteFramebuffers) Do(PFNGLDELETEPROGRAMPROC,   \
                                                                         glDeleteProgram)          \
                    Do(PFNGLDELETESHADERPROC, glDeleteShader) Do(PFNGLENABLEVERTEXATTRIBARRAYPROC, \
                                                                 glEnableVertexAttribArray)        \
                        Do(PFNGLFRAMEBUFFERTEXTURE2DPROC, glFramebufferTexture2D)                  \
                            Do(PFNGLGENBUFFERSPROC, glGenBuffers) Do(PFNGLGENFRAMEBUFFERSPROC,     \
                                                                     glGenFramebuffers)            \
                                Do(PFNGLGETATTRIBLOCATIONPROC, glGetAttribLocation) Do(            \
                                    PFNGLGETPROGRAMINFOLOGPROC,                                    \
                                    glGetProgramInfoLog) Do(PFNGLGETPROGRAMIVPROC, glGetProgramiv) \
                                    Do(PFNGLGETSHADERINFOLOGPROC, glGetShaderInfoLog)              \
                                        Do(PFNGLGETSHADERIVPROC, glGetShaderiv)                    \
                                            Do(PFNGLGETUNIFORMLOCATIONPROC, glGetUniformLocation)  \
                                                Do(PFNGLLINKPROGRAMPROC, glLinkProgram)            \
                                                    Do(PFNGLSHADERSOURCEPROC, glShaderSource)      \
                                                        Do(PFNGLUNIFORM4FPROC, glUniform4f)        \
                                                            Do(PFNGLUSEPROGRAMPROC, glUseProgram)  \
                                                                Do(PFNGLVERTEXATTRIBPOINTERPROC,   \
                                                                   glVertexAttribPointer)
#define LOADER_DEFINE(Type, Name) Type Name;
#define LOADER_LOAD(Type, Name)                                                                    \
    Name = reinterpret_cast<Type>(reinterpret_cast<void *>(::wglGetProcAddress(#Name)));
LOADER_FUNCTIONS(LOADER_DEFINE)
void loadFunctions() {
    LOADER_FUNCTIONS(LOADER_LOAD)
}

constexpr int kSize = 64;
float const kCorners[] = {-1, -1, 3, -1, -1, 3};

char const *const kVertexShader =
    "attribute vec2 position; void main() { gl_Position = vec4(position, 0.0, 1.0); }";
char const *const kFragmentShader = "uniform vec4 colour; void main() { gl_FragColor = colour; }";

// [plain]
void addShader(GLuint program, GLenum stage, char const *source) {
    GLuint const shader = glCreateShader(stage);
    glShaderSource(shader, 1, &source, nullptr);
    glCompileShader(shader);
    glAttachShader(program, shader);
    glDeleteShader(shader); // when the program goes
    GLint compiled = GL_FALSE;
    glGetShaderiv(shader, GL_COMPILE_STATUS, &compiled);
    char log[1024] = "";
    if (!compiled) {
        glGetShaderInfoLog(shader, sizeof log, nullptr, log);
        throw std::runtime_error(log); // and the program is left behind
    }
}

void fill(GLuint texture) { // a texture of kSize by kSize texels
    GLuint const program = glCreateProgram();
    addShader(program, GL_VERTEX_SHADER, kVertexShader);
    addShader(program, GL_FRAGMENT_SHADER, kFragmentShader);
    glLinkProgram(program);
    GLint linked = GL_FALSE;
    glGetProgramiv(program, GL_LINK_STATUS, &linked);
    if (!linked)
        throw std::runtime_error("the program does not link");

    GLuint framebuffer = 0;
    glGenFramebuffers(1, &framebuffer);
    glBindFramebuffer(GL_FRAMEBUFFER, framebuffer);
    glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, texture, 0);

    GLuint corners = 0;
    glGenBuffers(1, &corners);
    glBindBuffer(GL_ARRAY_BUFFER, corners);
    glBufferData(GL_ARRAY_BUFFER, sizeof kCorners, kCorners, GL_STATIC_DRAW);
    auto const position = static_cast<GLuint>(glGetAttribLocation(program, "position"));
    glVertexAttribPointer(position, 2, GL_FLOAT, GL_FALSE, 0, nullptr);
    glEnableVertexAttribArray(position);

    glViewport(0, 0, kSize, kSize);
    glUseProgram(program);
    glUniform4f(glGetUniformLocation(program, "colour"), 1.f, 0.4f, 0.f, 1.f);
    glDrawArrays(GL_TRIANGLES, 0, 3);
    GLenum const error = glGetError();

    glUseProgram(0);
    glBindFramebuffer(GL_FRAMEBUFFER, 0);
    glDeleteBuffers(1, &corners);
    glDeleteFramebuffers(1, &framebuffer);
    glDeleteProgram(program);
    if (error != GL_NO_ERROR) // of which of the calls?
        throw std::runtime_error("OpenGL error " + std::to_string(error));
}
// [plain]

namespace objects {

using namespace ORU::OGL;

// [objects]
void fill(Texture2D &texture) {
    Program program;
    program.loadVertexShader(1, &kVertexShader, nullptr);
    program.loadFragmentShader(1, &kFragmentShader, nullptr);
    program.link(true); // throws with the compiler's log

    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&texture, 0, 0);

    VertexBuffer corners(
        {{"position", VertexBuffer::ATTRIBUTETYPE_FLOAT2, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}},
        3, VertexBuffer::PRIMITIVETYPE_TRIANGLES);
    corners.setField("position", reinterpret_cast<unsigned char const *>(kCorners), false, 0, 0);
    corners.setupWithProgram(&program);
    corners.marshallData();

    ORU_GL(Viewport, 0, 0, kSize, kSize);
    ProgramEnabledScope const scope(&program);
    program.setUniform("colour", 1.f, 0.4f, 0.f, 1.f);
    corners.drawPrimitives();
    framebuffer.unbind();
}
// [objects]

} // namespace objects

/// The texture class of a host that has its own.
class HostTexture {
public:
    HostTexture() {
        ::glGenTextures(1, &name_);
        ::glBindTexture(GL_TEXTURE_2D, name_);
        ::glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA8, kSize, kSize, 0, GL_RGBA, GL_UNSIGNED_BYTE,
                       nullptr);
        ::glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_NEAREST);
        ::glBindTexture(GL_TEXTURE_2D, 0);
    }
    explicit HostTexture(GLuint name) : name_(name) {}
    ~HostTexture() { ::glDeleteTextures(1, &name_); }
    HostTexture(HostTexture const &) = delete;
    HostTexture &operator=(HostTexture const &) = delete;
    GLuint name() const { return name_; }

private:
    GLuint name_ = 0;
};

/// The texels of a texture, which must be all alike.
unsigned int TexelOf(GLuint texture) {
    std::vector<unsigned int> texels(kSize * kSize);
    ::glBindTexture(GL_TEXTURE_2D, texture);
    ::glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_UNSIGNED_BYTE, texels.data());
    ::glBindTexture(GL_TEXTURE_2D, 0);
    return texels == std::vector<unsigned int>(texels.size(), texels[0]) ? texels[0] : 0;
}

class ComingFromGuide : public ::testing::Test {
protected:
    ComingFromGuide() { context_.makeCurrent(); }

    ORU::OGL::AutoInitializer library_;
    ORU::OGL::ContextOffscreen context_;
};

} // namespace

TEST_F(ComingFromGuide, DoesTheSameBothWays) {
    loadFunctions();
    HostTexture const plain;
    fill(plain.name());

    using namespace ORU::OGL;
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, kSize, kSize, false);
    objects::fill(texture);
    EXPECT_EQ(TexelOf(plain.name()), TexelOf(texture.objectID()));
    EXPECT_EQ(0xFF0066FFu, TexelOf(plain.name()));
}

TEST_F(ComingFromGuide, LendsAndGives) {
    using namespace ORU::OGL;
    HostTexture const theirs;
    {
        // [lend]
        Texture2D lent(theirs.name(), borrow_name_tag()); // theirs to delete, as before
        objects::fill(lent);
        // [lend]
    }
    EXPECT_NE(0u, TexelOf(theirs.name()));
    // [give]
    Texture2D made(Texture::INTERNALFORMAT_RGBA8, kSize, kSize, false);
    objects::fill(made);
    HostTexture const given(made.disown()); // theirs to delete from now on
    // [give]
    EXPECT_EQ(TexelOf(theirs.name()), TexelOf(given.name()));
    // [take]
    GLuint name = 0;
    ::glGenTextures(1, &name);
    ::glBindTexture(GL_TEXTURE_2D, name);
    ::glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA8, kSize, kSize, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
    ::glBindTexture(GL_TEXTURE_2D, 0);
    {
        Texture2D const taken(name, take_name_tag()); // deletes it at its end
    }
    // [take]
    EXPECT_FALSE(::glIsTexture(name));
}
