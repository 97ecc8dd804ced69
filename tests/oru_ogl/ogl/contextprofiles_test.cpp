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

std::string RefusalOf(Attributes const &attributes) {
    ExtensionManager::ScopedInitOptions const scope(Options(attributes));
    return MessageOf([] { ContextOffscreen(); });
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

TEST(ContextProfiles, AreAsAskedFor) {
    struct Row {
        Attributes attributes;
        GLint leastVersion;
        GLint profile;
        GLint flags;
    } const rows[] = {
        {Attributes(), 30, kCompatibility, 0},
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
    for (auto const &[attributes, version, profile, flags] : rows) {
        SCOPED_TRACE(&attributes - &rows[0].attributes);
        ExtensionManager::ScopedInitOptions const scope(Options(attributes));
        ContextOffscreen const parent, child(&parent);
        child.makeCurrent();
        EXPECT_LE(version, Get(GL_MAJOR_VERSION) * 10 + Get(GL_MINOR_VERSION));
        EXPECT_EQ(profile, Get(GL_CONTEXT_PROFILE_MASK));
        EXPECT_EQ(flags, Get(GL_CONTEXT_FLAGS));
        EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
        EXPECT_TRUE(parent.isSharingWithCurrentContext());
        ReleaseOGLContext();
    }
}

// With GDI's choice of the format and the other; the temporary context of that one is as ever.
TEST(ContextProfiles, AWindowsFormatGoesBeforeTheOptions) {
    AutoInitializer library;
    ExtensionManager::ScopedInitOptions const scope(Options(Attributes().setVersion(9, 9)));
    BufferFormat format(BufferFormat::FORMAT_RGBA8_D24);
    format.setContextAttributes(Attributes().setVersion(4, 1).setProfile(OPENGLPROFILE_CORE));
    for (int const samples : {1, 4}) {
        TestWindow const window;
        ContextWindowed const windowed = Windowed(window, nullptr, format, samples);
        windowed.makeCurrent();
        EXPECT_EQ(kCore, Get(GL_CONTEXT_PROFILE_MASK));
        ReleaseOGLContext();
    }
}

// The sentence names what is refused, and nothing stays of the attempts.
TEST(ContextProfiles, RefusalsSayWhatAndLeaveNothing) {
    AutoInitializer library;
    InterceptorScope<ContextCounter> const counter;
    ContextOffscreen const current;
    current.makeCurrent();
    EXPECT_THAT(
        RefusalOf(Attributes().setVersion(9, 9).setProfile(OPENGLPROFILE_CORE).setDebug()),
        testing::StartsWith("No context of OpenGL 9.9, the core profile, debug: the driver refuses "
                            "OpenGL 9.9 (Windows error "));
    EXPECT_EQ(1u, ContextCounter::Alive());
    EXPECT_EQ(1, InternalWindows());
    EXPECT_EQ(current.renderContext(), ::wglGetCurrentContext());
    EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
    EXPECT_FAILURE("ContextAttributes::setVersion takes numbers up to 15, not 16 and 0",
                   Attributes().setVersion(16, 0));
}

// A driver that does not give what was asked for, and says nothing.
TEST(ContextProfiles, LesserContextsAreRefused) {
    AutoInitializer library;
    InterceptorScope<ContextCounter> const counter(true);
    std::pair<Attributes, char const *> const rows[] = {
        {Attributes().setVersion(9, 9), ", without that version. "},
        {Attributes().setProfile(OPENGLPROFILE_CORE), ", without that profile. "},
        {Attributes().setDebug(), ", without debug or robust access. "}};
    for (auto const &[attributes, missing] : rows) {
        EXPECT_THAT(RefusalOf(attributes), testing::HasSubstr(missing));
        EXPECT_EQ(0u, ContextCounter::Alive());
        EXPECT_EQ(0, InternalWindows());
    }
}

// Share groups of all profiles. Equal names are no sharing; no probe leaves an object or an error
// behind, and two compatibility contexts are probed by lists.
TEST(ContextProfiles, ShareGroupsAreFoundInEveryProfile) {
    /// Counts what makes contexts current.
    struct Switches : WGLForwarder {
        int count = 0;
        BOOL wcgmMakeCurrent(char const *file, unsigned int line, HDC dc, HGLRC rc) override {
            ++count;
            return WGLForwarder::wcgmMakeCurrent(file, line, dc, rc);
        }
    };
    auto const textures = [] {
        std::vector<GLboolean> are;
        for (GLuint name = 1; name < 9; ++name)
            are.push_back(::glIsTexture(name));
        return are;
    };
    AutoInitializer library;
    ContextOffscreen const known; // whose device the adopted ones take
    for (std::size_t i = 0; i < kHostKindCount * kHostKindCount * 2; ++i) {
        SCOPED_TRACE(i);
        bool const shares = i % 2;
        std::size_t const first = i / 2 % kHostKindCount, second = i / 2 / kHostKindCount;
        HostContext const one(nullptr, kHostKinds[first]);
        HostContext const other(shares ? one.rc() : nullptr, kHostKinds[second]);
        for (HostContext const *each : {&one, &other}) {
            each->makeCurrent();
            GLuint names[3] = {};
            ::glGenTextures(3, names);
            ::glBindTexture(GL_TEXTURE_2D, names[0]);
        }
        auto const before = textures();
        InterceptorScope<Switches> switches;
        known.makeCurrent();
        ContextWrapped const adopted(one.dc(), one.rc(), nullptr);
        switches->count = 0;
        ContextWrapped const twin(other.dc(), other.rc(), nullptr);
        bool const byLists = first == 0 && second == 0;
        int const withKnown = second == 0 ? 2 : 3; // a compatibility context
        EXPECT_EQ(withKnown + (shares ? 4 : byLists ? 2 : 3), switches->count);
        EXPECT_EQ(known.renderContext(), ::wglGetCurrentContext());
        other.makeCurrent();
        EXPECT_EQ(shares, adopted.isSharingWithCurrentContext());
        for (HostContext const *each : {&one, &other}) {
            each->makeCurrent();
            EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
            EXPECT_EQ(before, textures());
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
        std::optional<ContextWrapped> adopted;
        if (i % 2)
            adopted.emplace();
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
