// What the object classes say they support, refuse to make and do instead on implementations that
// lack something: the build runs this program under Mesa's overrides. What to expect is worked out
// from the texts that the implementation reports.
#include "tests/support/implementation.h"
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/shader.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <gmock/gmock.h>

#include <cstdlib>
#include <functional>

using namespace oru_test;

namespace {

bool AnySize() {
    return Has("GL_ARB_texture_non_power_of_two") || Version() >= 20;
}

/// The failure of a constructor with these needs: the first that the context does not meet.
std::string FirstUnmet(std::vector<std::pair<bool, char const *>> const &needs) {
    for (auto const &[met, name] : needs) {
        if (!met)
            return std::string("ExtensionManager::Instance()->isSupported(") + name + ")";
    }
    return "";
}

void MakeBuffer() {
    Buffer(4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr);
}

/// Takes the calls of Apple's client storage for itself, as no driver here has it, and writes down
/// what matters of their order.
class ClientStorage : public OpenGLForwarder {
public:
    std::string log;

    void cgmTexParameteri(char const *file, unsigned int line, GLenum target, GLenum name,
                          GLint value) override {
        if (name != GL_TEXTURE_STORAGE_HINT_APPLE)
            return OpenGLForwarder::cgmTexParameteri(file, line, target, name, value);
        EXPECT_EQ(static_cast<GLenum>(GL_TEXTURE_RECTANGLE), target);
        log += value == GL_STORAGE_CACHED_APPLE ? "cached " : "private ";
    }
    void cgmPixelStorei(char const *file, unsigned int line, GLenum name, GLint value) override {
        if (name != GL_UNPACK_CLIENT_STORAGE_APPLE)
            return OpenGLForwarder::cgmPixelStorei(file, line, name, value);
        log += value ? "on " : "off ";
    }
    void cgmTexImage2D(char const *file, unsigned int line, GLenum target, GLint level,
                       GLint internalFormat, GLsizei width, GLsizei height, GLint border,
                       GLenum format, GLenum type, void const *pixels) override {
        log += "image ";
        OpenGLForwarder::cgmTexImage2D(file, line, target, level, internalFormat, width, height,
                                       border, format, type, pixels);
    }
};

} // namespace

class CapabilitiesTest : public ObjectTest {};

TEST_F(CapabilitiesTest, FollowTheImplementationAndNeedAContext) {
    if (char const *expected = std::getenv("ORU_TEST_VERSION"); expected && *expected) {
        EXPECT_EQ(std::atoi(expected), Version()) << "the override works";
    }
    for (auto target : std::initializer_list<GLenum>{GL_TEXTURE_1D, GL_TEXTURE_2D, GL_TEXTURE_3D})
        EXPECT_TRUE(Texture::IsTargetSupported(target) && TextureState::IsTargetSupported(target));
    EXPECT_TRUE(Texture2D::IsSupported() && Texture3D::IsSupported());

    bool const framebuffers = Has("GL_EXT_framebuffer_object"),
               rectangles = Has("GL_ARB_texture_rectangle"), arrays = Has("GL_EXT_texture_array");
    std::vector<std::pair<std::function<bool()>, bool>> answers = {
        {Program::IsSupported, Version() >= 20},
        {Buffer::IsSupported,
         Has("GL_ARB_pixel_buffer_object") && Has("GL_ARB_vertex_buffer_object")},
        {Framebuffer::IsSupported, framebuffers},
        {Renderbuffer::IsSupported, framebuffers},
        {TextureRECT::IsSupported, rectangles},
        {TextureState::SupportsNonPowerOfTwo, AnySize()},
        {Texture::SupportsAutoMIPGeneration, Version() >= 14}};
    std::pair<GLenum, bool> const targets[] = {{GL_TEXTURE_RECTANGLE, rectangles},
                                               {GL_TEXTURE_1D_ARRAY, arrays},
                                               {GL_TEXTURE_2D_ARRAY, arrays},
                                               {GL_TEXTURE_CUBE_MAP, false}};
    for (auto const &[target, supported] : targets) {
        answers.emplace_back([t = target] { return Texture::IsTargetSupported(t); }, supported);
        answers.emplace_back([t = target] { return TextureState::IsTargetSupported(t); },
                             supported);
    }
    bool const programs = Version() >= 20,
               tessellation = programs && Has("GL_ARB_tessellation_shader");
    bool const shaders[] = {programs,        programs, tessellation, tessellation,
                            Version() >= 32, false,    false}; // by type
    for (std::size_t i = 0; i < std::size(shaders); ++i) {
        auto const type = static_cast<Shader::ShaderType>(i);
        answers.emplace_back([=] { return Shader::IsSupported(type); }, shaders[i]);
        EXPECT_FAILURE(shaders[i] ? "" : "Unsupported shader type", Shader shader(type)) << i;
    }
    for (std::size_t i = 0; i < answers.size(); ++i)
        EXPECT_EQ(answers[i].second, answers[i].first()) << "answer " << i;
    ScopedContextWrapper const restore;
    ::wglMakeCurrent(nullptr, nullptr);
    for (std::size_t i = 0; i < answers.size(); ++i)
        EXPECT_FALSE(answers[i].first()) << "answer " << i;
    EXPECT_FAILURE(FirstUnmet({{false, "GL_ARB_PIXEL_BUFFER_OBJECT"}}), MakeBuffer());
}

TEST_F(CapabilitiesTest, ObjectsRefuseWhatTheyLack) {
    bool const framebuffers = Has("GL_EXT_framebuffer_object");
    EXPECT_FAILURE(Version() >= 20 ? "" : "OpenGL shader programs must be supported", Program());
    EXPECT_FAILURE(FirstUnmet({{Has("GL_ARB_pixel_buffer_object"), "GL_ARB_PIXEL_BUFFER_OBJECT"},
                               {Has("GL_ARB_vertex_buffer_object"), "GL_ARB_VERTEX_BUFFER_OBJECT"},
                               {Version() >= 15, "GL_VERSION_1_5"}}),
                   MakeBuffer());
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
        bool const missing = kind.sides == 3 && Version() < 12;
        EXPECT_EQ(missing ? "ExtensionManager::Instance()->isSupported(GL_VERSION_1_2)" : "",
                  failure({8, 4, 2}, true))
            << kind.name;
        for (std::size_t side = 0; side < kind.sides; ++side) {
            SCOPED_TRACE(testing::Message() << kind.name << " side " << side);
            Sides size = {8, 4, 2};
            size[side] = 3;
            if (AnySize() || kind.target == GL_TEXTURE_RECTANGLE) {
                EXPECT_EQ("", failure(size, false));
            } else if (kind.sides == 2 && Has("GL_ARB_texture_rectangle")) {
                EXPECT_THAT(failure(size, false), testing::AnyOf("", "GL_INVALID_VALUE"));
            } else {
                EXPECT_EQ(std::string(kind.sides == 3 ? "Texture3" : "Texture2") +
                              "::ctor hardware only supports power of two textures",
                          failure(size, false));
            }
        }
    }
}

TEST_F(CapabilitiesTest, ClampsAndUnpacksByVersion) {
    BoundTexture const texture(
        std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA8, 4, 4, false));
    GLint wrap = 0;
    ORU_GL(GetTexParameteriv, GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, &wrap);
    EXPECT_EQ(Version() >= 12 ? GL_CLAMP_TO_EDGE : GL_CLAMP, wrap);
    InterceptorScope<CountingForwarder> counter;
    PixelUnpackParameters().apply();
    EXPECT_EQ(Version() >= 12 || Has("GL_EXT_texture3D") ? 8 : 6, counter->count("PixelStorei"));
}

TEST_F(CapabilitiesTest, ClientStorageIsSetAroundTheAllocation) {
    ASSERT_TRUE(Has("GL_APPLE_client_storage")) << "by the override";
    Image<std::uint16_t> pixels({4, 4, 1}, 4, 0x8000);
    InterceptorScope<ClientStorage> storage;
    BoundTexture const texture(std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA16, 4, 4,
                                                           false, &pixels.texels[0],
                                                           Texture::TYPE_UNSIGNED_SHORT));
    EXPECT_EQ("cached on image private off ", storage->log);
    EXPECT_EQ(&pixels.texels[0], dynamic_cast<Texture2 &>(*texture).clientStorage());
    EXPECT_EQ(pixels.texels,
              pixels.read(*texture, {Texture::FORMAT_BGRA, Texture::TYPE_UNSIGNED_SHORT}));
    storage->log.clear();
    EXPECT_FAILURE("GL_INVALID_VALUE",
                   Texture2D(Texture::INTERNALFORMAT_RGBA16, 1 << 15, 4, false, &pixels.texels[0]));
    EXPECT_EQ("cached on image private off ", storage->log) << "also when the allocation fails";
}
