// What the object classes say they support and refuse to make, under what Mesa is told to claim.
#include "tests/support/objecttest.h"

#include "oru/core/utility/versionstring.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/shader.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <algorithm>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

/// Whether the context's own version text is at least this.
bool IsVersion(unsigned int wantedMajor, unsigned int wantedMinor) {
    unsigned int major = 0, minor = 0;
    int release = 0;
    std::string rest;
    ORU::TokenizeVersionString(reinterpret_cast<char const *>(::glGetString(GL_VERSION)), major,
                               minor, release, rest);
    return major > wantedMajor || (major == wantedMajor && minor >= wantedMinor);
}

bool Has(char const *name) {
    auto const &names = ExtensionManager::Instance()->supportedExtensionNames();
    return std::find(names.begin(), names.end(), name) != names.end();
}

/// The failure of a constructor with these needs: the first that the context does not meet.
std::string Failure(std::vector<std::pair<bool, char const *>> const &needs) {
    for (auto const &[met, name] : needs) {
        if (!met)
            return std::string("ExtensionManager::Instance()->isSupported(") + name + ")";
    }
    return "";
}

} // namespace

class CapabilitiesTest : public ObjectTest {};

TEST_F(CapabilitiesTest, ShadersAndPrograms) {
    bool const programs = IsVersion(2, 0);
    EXPECT_EQ(programs, Program::IsSupported());
    EXPECT_FAILURE(programs ? "" : "OpenGL shader programs must be supported", Program());
    bool const tessellation = programs && Has("GL_ARB_tessellation_shader");
    bool const supported[] = {programs,        programs, tessellation, tessellation,
                              IsVersion(3, 2), false,    false};
    for (unsigned int i = 0; i < 7; ++i) {
        auto const type = static_cast<Shader::ShaderType>(i);
        EXPECT_EQ(supported[i], Shader::IsSupported(type)) << i;
        EXPECT_FAILURE(supported[i] ? "" : "Unsupported shader type", Shader shader(type)) << i;
    }
}

TEST_F(CapabilitiesTest, BuffersOfEveryKind) {
    bool const pixels = Has("GL_ARB_pixel_buffer_object"),
               vertices = Has("GL_ARB_vertex_buffer_object");
    EXPECT_EQ(pixels && vertices, Buffer::IsSupported());
    EXPECT_FAILURE(Failure({{pixels, "GL_ARB_PIXEL_BUFFER_OBJECT"},
                            {vertices, "GL_ARB_VERTEX_BUFFER_OBJECT"},
                            {IsVersion(1, 5), "GL_VERSION_1_5"}}),
                   Buffer(4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr));
    bool const framebuffers = Has("GL_EXT_framebuffer_object");
    EXPECT_EQ(framebuffers, Framebuffer::IsSupported());
    EXPECT_EQ(framebuffers, Renderbuffer::IsSupported());
    EXPECT_FAILURE(framebuffers ? "" : "IsSupported()", Framebuffer());
    EXPECT_FAILURE(Failure({{framebuffers, "GL_EXT_FRAMEBUFFER_OBJECT"}}),
                   Renderbuffer(GL_RGBA8, 1, 1));
    EXPECT_FAILURE(Failure({{IsVersion(2, 0), "GL_VERSION_2_0"},
                            {Has("GL_ARB_vertex_array_object"), "GL_ARB_VERTEX_ARRAY_OBJECT"}}),
                   VertexBuffer().setupWithProgram(0u));
}

TEST_F(CapabilitiesTest, NothingIsSupportedWithoutAContext) {
    ScopedContextWrapper const restore;
    ::wglMakeCurrent(nullptr, nullptr);
    EXPECT_FALSE(Program::IsSupported() || Shader::IsSupported(Shader::SHADERTYPE_VERTEX));
    EXPECT_FALSE(Buffer::IsSupported() || Framebuffer::IsSupported());
    EXPECT_FALSE(Renderbuffer::IsSupported());
    EXPECT_FAILURE(Failure({{false, "GL_ARB_PIXEL_BUFFER_OBJECT"}}),
                   Buffer(4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr));
}
