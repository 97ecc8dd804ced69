// Contexts that are asked for a version, a profile and flags, and the host's core contexts.
#include "tests/support/contexts.h"
#include "tests/support/glfixture.h"
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

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

/// What the current context says: ten times its version and a digit, the profile, the flags.
std::vector<GLint> Said() {
    return {Get(GL_MAJOR_VERSION) * 10 + Get(GL_MINOR_VERSION), Get(GL_CONTEXT_PROFILE_MASK),
            Get(GL_CONTEXT_FLAGS)};
}

/// What the host asks wglCreateContextAttribsARB for.
std::vector<int> List(int major, int minor, int attribute, int value) {
    return {WGL_CONTEXT_MAJOR_VERSION_ARB,
            major,
            WGL_CONTEXT_MINOR_VERSION_ARB,
            minor,
            attribute,
            value,
            0};
}

std::vector<int> const kHostKinds[] = {
    {WGL_CONTEXT_MAJOR_VERSION_ARB, 3, 0},
    List(3, 2, WGL_CONTEXT_PROFILE_MASK_ARB, kCore),
    List(4, 5, WGL_CONTEXT_PROFILE_MASK_ARB, kCore),
    List(3, 1, WGL_CONTEXT_FLAGS_ARB, WGL_CONTEXT_FORWARD_COMPATIBLE_BIT_ARB),
};
std::size_t const kHostKindCount = std::size(kHostKinds);

} // namespace

TEST(ContextProfiles, AreAsAskedFor) {
    struct Row {
        Attributes attributes;
        GLint leastVersion;
        GLint profile;
        GLint flags;
    } const rows[] = {
        {Attributes(), 30, kCompatibility, 0},
        {Attributes().setVersion(2, 1), 21, kCompatibility, 0},
        {Attributes().setProfile(OPENGLPROFILE_CORE), 32, kCore, 0},
        {Attributes().setVersion(3, 3).setProfile(OPENGLPROFILE_CORE), 33, kCore, 0},
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
        auto const said = Said();
        EXPECT_LE(version, said[0]);
        EXPECT_EQ((std::vector<GLint>{said[0], profile, flags}), said);
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
        EXPECT_EQ(kCore, Said()[1]);
        ReleaseOGLContext();
    }
}

// The sentence names what is refused, and nothing stays of the attempts.
TEST(ContextProfiles, RefusalsSayWhatAndLeaveNothing) {
    AutoInitializer library;
    Pushed<ContextCounter> const counter;
    ContextOffscreen const current;
    current.makeCurrent();
    auto const alive = ContextCounter::Alive();
    auto const expect = [&](Attributes const &attributes, std::string const &text) {
        ExtensionManager::ScopedInitOptions const scope(Options(attributes));
        EXPECT_THAT(MessageOf([] { ContextOffscreen(); }), testing::HasSubstr(text));
        EXPECT_EQ(alive, ContextCounter::Alive());
        EXPECT_EQ(1, InternalWindows());
        EXPECT_EQ(current.renderContext(), ::wglGetCurrentContext());
        EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
    };
    expect(Attributes().setVersion(9, 9).setProfile(OPENGLPROFILE_CORE).setDebug(),
           "No context of OpenGL 9.9, the core profile, debug: the driver refuses OpenGL 9.9 "
           "(Windows error ");
    expect(Attributes().setVersion(2, 1).setForwardCompatible(),
           "No context of OpenGL 2.1, forward compatibility: the driver refuses OpenGL 2.1 (");
    EXPECT_FAILURE("ContextAttributes::setVersion takes numbers up to 15, not 16 and 0",
                   Attributes().setVersion(16, 0));
}

// A driver that does not give what was asked for, and says nothing.
TEST(ContextProfiles, LesserContextsAreRefused) {
    /// Makes contexts of OpenGL 3.0, whatever is asked.
    struct Deaf : WGLForwarder {
        PROC wcgmGetProcAddress(char const *file, unsigned int line, char const *name) override {
            PROC const real = WGLForwarder::wcgmGetProcAddress(file, line, name);
            if (!real || std::string(name) != "wglCreateContextAttribsARB")
                return real;
            Create() =
                reinterpret_cast<PFNWGLCREATECONTEXTATTRIBSARBPROC>(reinterpret_cast<void *>(real));
            return reinterpret_cast<PROC>(reinterpret_cast<void *>(&Make));
        }
        static PFNWGLCREATECONTEXTATTRIBSARBPROC &Create() {
            static PFNWGLCREATECONTEXTATTRIBSARBPROC create = nullptr;
            return create;
        }
        static HGLRC WINAPI Make(HDC dc, HGLRC share, int const *) {
            int const least[] = {WGL_CONTEXT_MAJOR_VERSION_ARB, 3, 0};
            return Create()(dc, share, least);
        }
    };
    AutoInitializer library;
    Pushed<Deaf> const deaf;
    auto const expect = [](Attributes const &attributes, std::string const &missing) {
        ExtensionManager::ScopedInitOptions const scope(Options(attributes));
        EXPECT_THAT(MessageOf([] { ContextOffscreen(); }),
                    testing::AllOf(testing::HasSubstr("the driver made one of OpenGL "),
                                   testing::HasSubstr(", without " + missing + ". ")));
        EXPECT_EQ(0, InternalWindows());
    };
    expect(Attributes().setVersion(9, 9), "that version");
    expect(Attributes().setProfile(OPENGLPROFILE_CORE), "that profile");
    expect(Attributes().setDebug(), "debug or robust access");
}

// Share groups of all profiles. Equal names are no sharing; no
// probe leaves an object or an error behind, and two compatibility contexts are probed by lists.
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
        bool const byLists = first == 0 && second == 0;
        for (HostContext const *each : {&one, &other}) {
            each->makeCurrent();
            GLuint names[3] = {};
            ::glGenTextures(3, names);
            ::glBindTexture(GL_TEXTURE_2D, names[0]);
        }
        auto const before = textures();
        Pushed<Switches> switches;
        known.makeCurrent();
        ContextWrapped const adopted(one.dc(), one.rc(), nullptr);
        switches->count = 0;
        ContextWrapped const twin(other.dc(), other.rc(), nullptr);
        int const perStranger = second == 0 ? 2 : 3; // `known`, a compatibility context
        EXPECT_EQ(perStranger + (shares ? 4 : byLists ? 2 : 3), switches->count);
        EXPECT_EQ(known.renderContext(), ::wglGetCurrentContext());
        other.makeCurrent();
        EXPECT_EQ(shares, adopted.isSharingWithCurrentContext());
        for (HostContext const *each : {&other, &one}) {
            EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
            EXPECT_EQ(before, textures());
            EXPECT_NE(0, Get(GL_TEXTURE_BINDING_2D));
            each->makeCurrent();
        }
        EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
    }
}

// What hosts do in a core context of theirs, adopted or not: pixels there and back, drawing with
// shaders into a framebuffer; and what is asked of the record.
TEST(ContextProfiles, HostsCoreContextsWork) {
    // Whatever the host wants of its contexts, the test of filters draws in one that can do it.
    ExtensionManager::ScopedInitOptions const scope(
        Options(Attributes().setProfile(OPENGLPROFILE_CORE)));
    for (bool const isAdopted : {false, true}) {
        for (std::size_t i = 1; i < kHostKindCount; ++i) {
            SCOPED_TRACE(testing::Message() << isAdopted << i);
            AutoInitializer library;
            HostContext const host(nullptr, kHostKinds[i]);
            std::optional<ContextWrapped> adopted;
            if (isAdopted)
                adopted.emplace();
            Pushed<CoreShaders> const shaders;
            Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 4, 4, true);
            ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
            Image<unsigned char> const image({4, 4, 1}, 4, 77);
            Pixel const bytes{Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE};
            image.upload(texture, bytes);
            texture.generateMipmap();
            EXPECT_EQ(image.texels, image.read(texture, bytes));
            ORU_GL(BindTexture, GL_TEXTURE_2D, 0u);

            Framebuffer framebuffer;
            framebuffer.bind();
            Renderbuffer depth(GL_DEPTH_COMPONENT24, 4, 4);
            framebuffer.attach(&texture, 0, 0);
            framebuffer.attach(&depth, 0);
            EXPECT_TRUE(framebuffer.statusOkay(nullptr));
            Program program;
            char const *const vertex =
                "attribute vec2 at; void main() { gl_Position = vec4(at, 0, 1); }";
            char const *const fragment = "void main() { gl_FragColor = vec4(1, 0, 0, 1); }";
            program.loadVertexShader(1, &vertex, nullptr);
            program.loadFragmentShader(1, &fragment, nullptr);
            program.link(true);
            VertexBuffer triangle({{"at", VertexBuffer::ATTRIBUTETYPE_FLOAT2,
                                    VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}},
                                  3, VertexBuffer::PRIMITIVETYPE_TRIANGLES);
            float const corners[] = {-1, -1, 3, -1, -1, 3};
            triangle.setField("at", reinterpret_cast<unsigned char const *>(corners), false, 0, 0);
            triangle.setupWithProgram(&program);
            triangle.marshallData();
            ORU_GL(Viewport, 0, 0, 4, 4);
            program.enable();
            triangle.drawPrimitives();
            program.disable();
            framebuffer.unbind();
            ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
            EXPECT_EQ(0xFF0000FFu,
                      *reinterpret_cast<unsigned int const *>(image.read(texture, bytes).data()));

            ExtensionManager &record = *ExtensionManager::Instance();
            EXPECT_EQ(static_cast<unsigned int>(Get(GL_MAX_TEXTURE_IMAGE_UNITS)),
                      record.numberOfTextureUnits());
            EXPECT_TRUE(record.supportsFloatFiltering());
            EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
        }
    }
}
