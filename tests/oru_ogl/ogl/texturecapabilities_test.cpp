// What textures do on implementations that lack something; the build runs this program under
// Mesa's overrides. What to expect is worked out from the texts that the implementation reports.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/texturestate.h"

#include <gmock/gmock.h>

#include <cstdlib>

using namespace oru_test;

namespace {

/// The version as one number, 15 for 1.5.
int Version() {
    auto const *const text = reinterpret_cast<char const *>(::glGetString(GL_VERSION));
    return (text[0] - '0') * 10 + (text[2] - '0');
}

bool Has(char const *extension) {
    auto const &names = ExtensionManager::Instance()->supportedExtensionNames();
    return std::find(names.begin(), names.end(), extension) != names.end();
}

bool AnySize() {
    return Has("GL_ARB_texture_non_power_of_two") || Version() >= 20;
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

class TextureCapabilitiesTest : public ObjectTest {};

TEST_F(TextureCapabilitiesTest, AnswersFollowTheImplementation) {
    if (char const *expected = std::getenv("ORU_TEST_VERSION")) {
        EXPECT_EQ(std::atoi(expected), Version()) << "the override works";
    }
    EXPECT_EQ(AnySize(), TextureState::SupportsNonPowerOfTwo());
    EXPECT_EQ(Has("GL_ARB_texture_rectangle"), TextureRECT::IsSupported());
    EXPECT_EQ(Version() >= 14, Texture::SupportsAutoMIPGeneration());
    EXPECT_TRUE(Texture2D::IsSupported() && Texture3D::IsSupported());
    bool const arrays = Has("GL_EXT_texture_array");
    std::pair<GLenum, bool> const rows[] = {
        {GL_TEXTURE_1D, true},         {GL_TEXTURE_2D, true},
        {GL_TEXTURE_3D, true},         {GL_TEXTURE_RECTANGLE, Has("GL_ARB_texture_rectangle")},
        {GL_TEXTURE_1D_ARRAY, arrays}, {GL_TEXTURE_2D_ARRAY, arrays},
        {GL_TEXTURE_CUBE_MAP, false}};
    for (auto const &[target, supported] : rows) {
        EXPECT_EQ(supported, Texture::IsTargetSupported(target)) << target;
        EXPECT_EQ(supported, TextureState::IsTargetSupported(target)) << target;
    }
}

// Each odd side of each kind is refused with the library's text, or left to OpenGL to decide.
TEST_F(TextureCapabilitiesTest, OddSizesNeedTheCapability) {
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

TEST_F(TextureCapabilitiesTest, ClampsAndUnpacksByVersion) {
    BoundTexture const texture(
        std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA8, 4, 4, false));
    GLint wrap = 0;
    ORU_GL(GetTexParameteriv, GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, &wrap);
    EXPECT_EQ(Version() >= 12 ? GL_CLAMP_TO_EDGE : GL_CLAMP, wrap);
    Pushed<CountingForwarder> counter;
    PixelUnpackParameters().apply();
    EXPECT_EQ(Version() >= 12 || Has("GL_EXT_texture3D") ? 8 : 6, counter->count("PixelStorei"));
}

TEST_F(TextureCapabilitiesTest, ClientStorageIsSetAroundTheAllocation) {
    if (!Has("GL_APPLE_client_storage"))
        GTEST_SKIP() << "GL_APPLE_client_storage is not reported";
    Image<std::uint16_t> pixels({4, 4, 1}, 4, 0x8000);
    Pushed<ClientStorage> storage;
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
