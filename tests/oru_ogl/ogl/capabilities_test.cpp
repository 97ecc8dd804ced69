// What the object classes support, refuse to make and do instead where something is missing: the
// build runs this under Mesa's overrides. What to expect follows from the texts that they report.
#include "tests/support/implementation.h"
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/shader.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <cstdlib>
#include <functional>

using namespace oru_test;

namespace {

bool AnySize() {
    return Has("GL_ARB_texture_non_power_of_two") || Version() >= 20;
}

/// The failure of a constructor with these needs: the first that the context does not meet.
std::string FirstUnmet(std::vector<std::pair<bool, char const *>> const &needs) {
    for (auto const &[met, name] : needs)
        if (!met)
            return std::string("ExtensionManager::Instance()->isSupported(") + name + ")";
    return "";
}

} // namespace

class CapabilitiesTest : public ObjectTest {};

TEST_F(CapabilitiesTest, FollowTheImplementationAndNeedAContext) {
    char const *const version = std::getenv("ORU_TEST_VERSION");
    ASSERT_NE(nullptr, version);
    EXPECT_TRUE(!*version || std::atoi(version) == Version()) << "the override works";
    bool const programs = Version() >= 20, framebuffers = Has("GL_EXT_framebuffer_object"),
               rectangles = Has("GL_ARB_texture_rectangle"), arrays = Has("GL_EXT_texture_array");
    std::vector<std::pair<std::function<bool()>, bool>> answers = {
        {Program::IsSupported, programs},
        {Buffer::IsSupported,
         Has("GL_ARB_pixel_buffer_object") && Has("GL_ARB_vertex_buffer_object")},
        {Framebuffer::IsSupported, framebuffers},
        {Renderbuffer::IsSupported, framebuffers},
        {TextureRECT::IsSupported, rectangles},
        {TextureState::SupportsNonPowerOfTwo, AnySize()},
        {Texture::SupportsAutoMIPGeneration, Version() >= 14}};
    std::pair<GLenum, bool> const targets[] = {{GL_TEXTURE_RECTANGLE, rectangles},
                                               {GL_TEXTURE_2D_ARRAY, arrays},
                                               {GL_TEXTURE_CUBE_MAP, false}};
    for (auto const &[target, supported] : targets)
        answers.emplace_back([t = target] { return Texture::IsTargetSupported(t); }, supported);
    bool const tessellation = Has("GL_ARB_tessellation_shader");
    bool const shaders[] = {programs,        programs, tessellation, tessellation,
                            Version() >= 32, false,    false}; // by type
    for (std::size_t i = 0; i < std::size(shaders); ++i) {
        auto const type = static_cast<Shader::ShaderType>(i);
        answers.emplace_back([=] { return Shader::IsSupported(type); }, shaders[i]);
        std::string const refusal = !shaders[i] ? "Unsupported shader type"
                                    : programs  ? ""
                                                : "glCreateShader is not in ";
        EXPECT_EQ(refusal, MessageOf([&] { Shader shader(type); }).substr(0, 25)) << i;
    }
    for (std::size_t i = 0; i < answers.size(); ++i) {
        EXPECT_EQ(answers[i].second, answers[i].first()) << "answer " << i;
        ScopedContextWrapper const restore;
        ::wglMakeCurrent(nullptr, nullptr);
        EXPECT_FALSE(answers[i].first()) << "answer " << i;
    }
}

TEST_F(CapabilitiesTest, ObjectsRefuseWhatTheyLack) {
    bool const framebuffers = Has("GL_EXT_framebuffer_object");
    EXPECT_FAILURE(Version() >= 20 ? "" : "OpenGL shader programs must be supported", Program());
    EXPECT_FAILURE(FirstUnmet({{Has("GL_ARB_pixel_buffer_object"), "GL_ARB_PIXEL_BUFFER_OBJECT"},
                               {Has("GL_ARB_vertex_buffer_object"), "GL_ARB_VERTEX_BUFFER_OBJECT"},
                               {Version() >= 15, "GL_VERSION_1_5"}}),
                   Buffer(4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr));
    EXPECT_FAILURE(framebuffers ? "" : "IsSupported()", Framebuffer());
    EXPECT_FAILURE(FirstUnmet({{framebuffers, "GL_EXT_FRAMEBUFFER_OBJECT"}}),
                   Renderbuffer(GL_RGBA8, 1, 1));
    EXPECT_FAILURE(FirstUnmet({{Version() >= 20, "GL_VERSION_2_0"},
                               {Has("GL_ARB_vertex_array_object"), "GL_ARB_VERTEX_ARRAY_OBJECT"}}),
                   VertexBuffer().setupWithProgram(0u));
}

// Each odd side of each kind is refused with the library's text, or left to OpenGL to decide.
TEST_F(CapabilitiesTest, OddSizesNeedTheCapability) {
    for (TextureKind const &kind : kTextureKinds) {
        if (!Texture::IsTargetSupported(kind.target))
            continue;
        auto const failure = [&](Sides const &size, bool mipmapped) {
            return MessageOf([&] { kind.make(Texture::INTERNALFORMAT_RGBA8, size, mipmapped); });
        };
        EXPECT_EQ(kind.sides < 3 || Version() >= 12 ? "" : "glTexImage3D is not in ",
                  failure({8, 4, 2}, true).substr(0, 23))
            << kind.name;
        for (std::size_t side = 0; side < kind.sides; ++side) {
            Sides size = {8, 4, 2};
            size[side] = 3;
            std::string const refusal = std::string(kind.sides == 3 ? "Texture3" : "Texture2") +
                                        "::ctor hardware only supports power of two textures";
            bool const isLeftToOpenGL = AnySize() || kind.target == GL_TEXTURE_RECTANGLE ||
                                        (kind.sides == 2 && Has("GL_ARB_texture_rectangle"));
            EXPECT_EQ(!isLeftToOpenGL, failure(size, false) == refusal) << kind.name << side;
        }
    }
}

TEST_F(CapabilitiesTest, ClampsAndUnpacksByVersion) {
    BoundTexture const texture(
        std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA8, 4, 4, false));
    EXPECT_EQ(Version() >= 12 ? GL_CLAMP_TO_EDGE : GL_CLAMP, Sampling(GL_TEXTURE_2D, 1)[2]);
    InterceptorScope<CountingForwarder> counter;
    PixelUnpackParameters().apply();
    EXPECT_EQ(Version() >= 12 || Has("GL_EXT_texture3D") ? 8 : 6, counter->count("PixelStorei"));
}
