// Contexts that are asked for a version, a profile and flags, and the host's core contexts.
#include "tests/support/contexts.h"
#include "tests/support/texturekinds.h"

#include <gmock/gmock.h>

using namespace oru_test;

namespace {

using Attributes = ContextAttributes;

constexpr int kCore = GL_CONTEXT_CORE_PROFILE_BIT;
constexpr int kCompatibility = GL_CONTEXT_COMPATIBILITY_PROFILE_BIT;

ExtensionManager::InitOptions Options(Attributes const &attributes) {
    ExtensionManager::InitOptions options;
    options.setContextAttributes(attributes);
    return options;
}

/// What hosts ask wglCreateContextAttribsARB for; only the first gives a compatibility context.
std::vector<int> const kHostKinds[] = {
    {WGL_CONTEXT_MAJOR_VERSION_ARB, 3, 0},
    {WGL_CONTEXT_MAJOR_VERSION_ARB, 4, WGL_CONTEXT_PROFILE_MASK_ARB, kCore, 0},
    {WGL_CONTEXT_MAJOR_VERSION_ARB, 3, WGL_CONTEXT_MINOR_VERSION_ARB, 1, WGL_CONTEXT_FLAGS_ARB,
     WGL_CONTEXT_FORWARD_COMPATIBLE_BIT_ARB, 0},
};
constexpr std::size_t kHostKindCount = std::size(kHostKinds);

} // namespace

// Asked for by the options, and by a window's format, which goes before them: with GDI's choice of
// the format and the other, whose temporary context is as ever.
TEST(ContextProfiles, AreAsAskedFor) {
    struct Row {
        Attributes attributes;
        GLint leastVersion, profile, flags;
    } const rows[] = {
        {Attributes().setProfile(OPENGLPROFILE_CORE), 32, kCore, 0},
        {Attributes().setVersion(4, 5).setProfile(OPENGLPROFILE_CORE).setDebug(), 45, kCore,
         GL_CONTEXT_FLAG_DEBUG_BIT},
        {Attributes().setVersion(4, 3).setProfile(OPENGLPROFILE_COMPATIBILITY), 43, kCompatibility,
         0},
        {Attributes().setRobust(), 30, kCompatibility, GL_CONTEXT_FLAG_ROBUST_ACCESS_BIT},
        {Attributes().setNoError(), 30, kCompatibility, GL_CONTEXT_FLAG_NO_ERROR_BIT},
        {Attributes().setVersion(3, 2).setForwardCompatible(), 32, kCore,
         GL_CONTEXT_FLAG_FORWARD_COMPATIBLE_BIT},
    };
    AutoInitializer library;
    for (Row const &row : rows) {
        auto const expect = [&row](Context const &context) {
            context.makeCurrent();
            EXPECT_LE(row.leastVersion, Get(GL_MAJOR_VERSION) * 10 + Get(GL_MINOR_VERSION));
            EXPECT_EQ(row.profile, Get(GL_CONTEXT_PROFILE_MASK));
            EXPECT_EQ(row.flags, Get(GL_CONTEXT_FLAGS));
            EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
        };
        SCOPED_TRACE(&row - rows);
        ExtensionManager::ScopedInitOptions const options(Options(row.attributes));
        ContextOffscreen const parent, child(&parent);
        expect(child);
        EXPECT_TRUE(parent.isSharingWithCurrentContext());
        ReleaseOGLContext();

        ExtensionManager::ScopedInitOptions const others(Options(Attributes().setVersion(9, 9)));
        TestWindow const window(0);
        BufferFormat format(BufferFormat::FORMAT_RGBA8_D24);
        expect(Windowed(window, nullptr, format.setContextAttributes(row.attributes),
                        row.flags ? 4 : 1));
    }
}

// By a driver that says so, or by one that makes another context and says nothing.
TEST(ContextProfiles, RefusalsSayWhatAndLeaveNothing) {
    struct Row {
        bool isDeaf;
        Attributes attributes;
        char const *text;
    } const rows[] = {
        {false, Attributes().setVersion(9, 9).setProfile(OPENGLPROFILE_CORE).setDebug(),
         "No context of OpenGL 9.9, the core profile, debug: the driver refuses OpenGL 9.9 ("},
        {true, Attributes().setVersion(9, 9), ", without that version. "},
        {true, Attributes().setProfile(OPENGLPROFILE_CORE), ", without that profile. "},
        {true, Attributes().setDebug(), ", without debug or robust access. "}};
    for (auto const &[isDeaf, attributes, text] : rows) {
        AutoInitializer library;
        InterceptorScope<ContextCounter> const counter(isDeaf);
        ContextOffscreen const current;
        current.makeCurrent();
        ExtensionManager::ScopedInitOptions const scope(Options(attributes));
        EXPECT_THAT(MessageOf([] { ContextOffscreen(); }), testing::HasSubstr(text));
        EXPECT_EQ(1u, ContextCounter::Alive());
        EXPECT_EQ(1, InternalWindows());
        EXPECT_EQ(current.renderContext(), ::wglGetCurrentContext());
        EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
    }
}

// Equal names are no sharing, and no probe leaves an object or an error behind.
TEST(ContextProfiles, ShareGroupsAreFoundInEveryProfile) {
    auto const textures = [] {
        int count = 0;
        for (GLuint name = 1; name < 9; ++name)
            count += ::glIsTexture(name);
        return count;
    };
    AutoInitializer library;
    ContextOffscreen const known; // whose device the adopted ones take
    for (std::size_t i = 0; i < kHostKindCount * kHostKindCount * 2; ++i) {
        SCOPED_TRACE(i);
        bool const shares = i % 2;
        HostContext const one(nullptr, kHostKinds[i / 2 % kHostKindCount]);
        HostContext const other(shares ? one.rc() : nullptr, kHostKinds[i / 2 / kHostKindCount]);
        for (HostContext const *each : {&one, &other}) {
            each->makeCurrent();
            GLuint names[3] = {};
            ::glGenTextures(3, names);
            ::glBindTexture(GL_TEXTURE_2D, names[0]);
        }
        known.makeCurrent();
        ContextWrapped const adopted(one.dc(), one.rc(), nullptr);
        ContextWrapped const twin(other.dc(), other.rc(), nullptr);
        EXPECT_EQ(known.renderContext(), ::wglGetCurrentContext());
        other.makeCurrent();
        EXPECT_EQ(shares, adopted.isSharingWithCurrentContext());
        for (HostContext const *each : {&one, &other}) {
            each->makeCurrent();
            EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
            EXPECT_EQ(shares ? 2 : 1, textures());
            EXPECT_NE(0, Get(GL_TEXTURE_BINDING_2D));
        }
    }
}

// Pixels there and back in a core context of the host's, adopted or not, and what is asked of the
// record.
TEST(ContextProfiles, HostsCoreContextsWork) {
    // Whatever the host wants of its contexts, the test of filters draws in one that can do it.
    ExtensionManager::ScopedInitOptions const scope(
        Options(Attributes().setProfile(OPENGLPROFILE_CORE)));
    for (std::size_t i = 2; i < kHostKindCount * 2; ++i) {
        SCOPED_TRACE(i);
        AutoInitializer library;
        HostContext const host(nullptr, kHostKinds[i / 2]);
        auto const adopted = i % 2 ? std::make_unique<ContextWrapped>() : nullptr;
        Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 4, 4, true);
        ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
        Image<unsigned char> const image({4, 4, 1}, 4, 77);
        Pixel const bytes{Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE};
        image.upload(texture, bytes);
        texture.generateMipmap();
        EXPECT_EQ(image.texels, image.read(texture, bytes));

        ExtensionManager &record = *ExtensionManager::Instance();
        EXPECT_EQ(static_cast<unsigned int>(Get(GL_MAX_TEXTURE_IMAGE_UNITS)),
                  record.numberOfTextureUnits());
        EXPECT_TRUE(record.supportsFloatFiltering());
        EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
    }
}
