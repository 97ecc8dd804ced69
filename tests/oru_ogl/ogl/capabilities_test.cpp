// What the object classes say they support and refuse to make, under what Mesa is told to claim.
#include "objecttest.h"

#include "oru/core/utility/versionstring.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/shader.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <algorithm>

using namespace ORU::OGL;
using oru_test::MessageOf;

namespace {

class CapabilitiesTest : public oru_test::ObjectTest {
protected:
    /// Whether the context's own version text is at least this.
    static bool isVersion(unsigned int wantedMajor, unsigned int wantedMinor) {
        unsigned int major = 0, minor = 0;
        int release = 0;
        std::string rest;
        ORU::TokenizeVersionString(reinterpret_cast<char const *>(::glGetString(GL_VERSION)), major,
                                   minor, release, rest);
        return major > wantedMajor || (major == wantedMajor && minor >= wantedMinor);
    }
    static bool has(char const *name) {
        auto const &names = ExtensionManager::Instance()->supportedExtensionNames();
        return std::find(names.begin(), names.end(), name) != names.end();
    }
};

} // namespace

TEST_F(CapabilitiesTest, ShadersAndPrograms) {
    RecordProperty("version", reinterpret_cast<char const *>(::glGetString(GL_VERSION)));
    bool const programs = isVersion(2, 0);
    EXPECT_EQ(programs, Program::IsSupported());
    EXPECT_EQ(programs ? "" : "OpenGL shader programs must be supported",
              MessageOf([] { Program program; }));
    bool const tessellation = programs && has("GL_ARB_tessellation_shader");
    struct Kind {
        Shader::ShaderType type;
        bool supported;
    } const kinds[] = {{Shader::SHADERTYPE_FRAGMENT, programs},
                       {Shader::SHADERTYPE_VERTEX, programs},
                       {Shader::SHADERTYPE_TESSELLATION_CONTROL, tessellation},
                       {Shader::SHADERTYPE_TESSELLATION_EVALUATION, tessellation},
                       {Shader::SHADERTYPE_GEOMETRY, isVersion(3, 2)},
                       {Shader::SHADERTYPE_COMPUTE, false}};
    for (Kind const &kind : kinds) {
        EXPECT_EQ(kind.supported, Shader::IsSupported(kind.type)) << kind.type;
        EXPECT_EQ(kind.supported ? "" : "Unsupported shader type",
                  MessageOf([&] { Shader shader(kind.type); }))
            << kind.type;
    }
}

TEST_F(CapabilitiesTest, FramebuffersAndVertexArrays) {
    bool const framebuffers = has("GL_EXT_framebuffer_object");
    EXPECT_EQ(framebuffers, Framebuffer::IsSupported());
    EXPECT_EQ(framebuffers, Renderbuffer::IsSupported());
    EXPECT_EQ(framebuffers ? "" : "IsSupported()", MessageOf([] { Framebuffer framebuffer; }));
    EXPECT_EQ(framebuffers ? ""
                           : "ExtensionManager::Instance()->isSupported(GL_EXT_FRAMEBUFFER_OBJECT)",
              MessageOf([] { Renderbuffer renderbuffer(GL_RGBA8, 1, 1); }));

    char const *const needed = !isVersion(2, 0)                     ? "GL_VERSION_2_0"
                               : !has("GL_ARB_vertex_array_object") ? "GL_ARB_VERTEX_ARRAY_OBJECT"
                                                                    : nullptr;
    EXPECT_EQ(needed ? std::string("ExtensionManager::Instance()->isSupported(") + needed + ")"
                     : "",
              MessageOf([] { VertexBuffer().setupWithProgram(0u); }));
}

TEST_F(CapabilitiesTest, NothingIsSupportedWithoutAContext) {
    ScopedContextWrapper const restore;
    ::wglMakeCurrent(nullptr, nullptr);
    EXPECT_FALSE(Program::IsSupported());
    EXPECT_FALSE(Shader::IsSupported(Shader::SHADERTYPE_VERTEX));
    EXPECT_FALSE(Framebuffer::IsSupported());
    EXPECT_FALSE(Renderbuffer::IsSupported());
}
