// What textures do on implementations that lack something; the build runs this program under
// Mesa's overrides. What to expect is worked out from the texts that the implementation reports.
#include "texturekinds.h"

#include "oru/oru_ogl/ogl/texturestate.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <cstdlib>

using namespace ORU::OGL;
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
    struct {
        GLenum target;
        bool supported;
    } const rows[] = {{GL_TEXTURE_1D, true},
                      {GL_TEXTURE_2D, true},
                      {GL_TEXTURE_3D, true},
                      {GL_TEXTURE_RECTANGLE, Has("GL_ARB_texture_rectangle")},
                      {GL_TEXTURE_1D_ARRAY, Has("GL_EXT_texture_array")},
                      {GL_TEXTURE_2D_ARRAY, Has("GL_EXT_texture_array")},
                      {GL_TEXTURE_CUBE_MAP, false},
                      {GL_TEXTURE_BUFFER, false}};
    for (auto const &row : rows) {
        EXPECT_EQ(row.supported, Texture::IsTargetSupported(row.target)) << row.target;
        EXPECT_EQ(row.supported, TextureState::IsTargetSupported(row.target)) << row.target;
    }
}

// Each odd side of each kind is refused with the library's text, or left to OpenGL to decide.
TEST_F(TextureCapabilitiesTest, OddSizesNeedTheCapability) {
    for (TextureKind const &kind : kTextureKinds) {
        if (!Texture::IsTargetSupported(kind.target) || (kind.sides == 3 && Version() < 12))
            continue;
        auto const failure = [&](Sides const &size, bool mipmapped) {
            return MessageOf([&] { kind.make(Texture::INTERNALFORMAT_RGBA8, size, mipmapped); });
        };
        EXPECT_EQ("", failure({8, 4, 2}, true)) << kind.name;
        for (std::size_t side = 0; side < kind.sides; ++side) {
            SCOPED_TRACE(testing::Message() << kind.name << " side " << side);
            Sides size = {8, 4, 2};
            size[side] = 3;
            if (AnySize() || kind.target == GL_TEXTURE_RECTANGLE) {
                EXPECT_EQ("", failure(size, false));
            } else if (kind.sides == 2 && Has("GL_ARB_texture_rectangle")) {
                EXPECT_THAT(failure(size, false), testing::AnyOf("", "GL_INVALID_VALUE"));
            } else {
                EXPECT_EQ(kind.sides == 3
                              ? "Texture3::ctor hardware only supports power of two textures"
                              : "Texture2::ctor hardware only supports power of two textures",
                          failure(size, false));
            }
        }
    }
}

TEST_F(TextureCapabilitiesTest, ClampsAndUnpacksByVersion) {
    Texture2D const texture(Texture::INTERNALFORMAT_RGBA8, 4, 4, false);
    Bind(texture);
    GLint wrap = 0;
    ORU_GL(GetTexParameteriv, GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, &wrap);
    EXPECT_EQ(Version() >= 12 ? GL_CLAMP_TO_EDGE : GL_CLAMP, wrap);
    Unbind(texture);
    Pushed<CountingForwarder> counter;
    PixelUnpackParameters().apply();
    EXPECT_EQ(Version() >= 12 || Has("GL_EXT_texture3D") ? 8 : 6, counter->count("PixelStorei"));
}

TEST_F(TextureCapabilitiesTest, ClientStorageIsSetAroundTheAllocation) {
    if (!Has("GL_APPLE_client_storage"))
        GTEST_SKIP() << "GL_APPLE_client_storage is not reported";
    std::vector<std::uint16_t> pixels(4 * 4 * 4, 0x8000), read(pixels.size());
    Pushed<ClientStorage> storage;
    Texture2D const texture(Texture::INTERNALFORMAT_RGBA16, 4, 4, false, pixels.data(),
                            Texture::TYPE_UNSIGNED_SHORT);
    EXPECT_EQ("cached on image private off ", storage->log);
    EXPECT_EQ(pixels.data(), texture.clientStorage());
    Bind(texture);
    texture.getPixelData(read.data(), 0, Texture::FORMAT_BGRA, Texture::TYPE_UNSIGNED_SHORT, 1);
    EXPECT_EQ(pixels, read);
    Unbind(texture);

    storage->log.clear();
    EXPECT_NE("", MessageOf([&] {
                  Texture2D(Texture::INTERNALFORMAT_RGBA16, 1 << 15, 4, false, pixels.data());
              }));
    EXPECT_EQ("cached on image private off ", storage->log) << "also when the allocation fails";
}
