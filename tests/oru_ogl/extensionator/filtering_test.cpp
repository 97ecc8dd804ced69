// The test by drawing of whether floating-point textures are filtered.
#include "../contexts/testwindow.h"
#include "../glfixture.h"

#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/wgl/wglforwarder.h"

#include <algorithm>
#include <cstring>
#include <memory>

using namespace ORU::OGL;
using oru_test::ContextCounter;
using oru_test::CountingForwarder;
using oru_test::InternalWindowClasses;
using oru_test::OffscreenTest;
using oru_test::Pushed;

namespace {

/// Filters nothing, or fails in the middle of the drawing.
class Obstacle : public OpenGLForwarder {
public:
    bool filters = true;
    bool fails = false;

    void cgmTexParameteri(char const *file, unsigned int line, GLenum target, GLenum pname,
                          GLint param) override {
        if (!filters && param == GL_LINEAR)
            param = GL_NEAREST;
        OpenGLForwarder::cgmTexParameteri(file, line, target, pname, param);
    }
    void cgmTexCoord2f(char const *file, unsigned int line, GLfloat s, GLfloat t) override {
        if (fails && s > 0)
            throw ORU::InternalException(file, static_cast<int>(line), "an obstacle");
        OpenGLForwarder::cgmTexCoord2f(file, line, s, t);
    }
};

/// Hides WGL_ARB_render_texture from the records that are built meanwhile.
class FewWGLExtensions : public WGLForwarder {
public:
    FewWGLExtensions() { WGLInterceptor::Instance()->addInterceptor(this); }
    ~FewWGLExtensions() override { WGLInterceptor::Instance()->popInterceptor(); }

    PROC wcgmGetProcAddress(char const *file, unsigned int line, char const *name) override {
        if (!std::strcmp(name, "wglGetExtensionsStringARB"))
            return reinterpret_cast<PROC>(reinterpret_cast<void *>(&Text));
        return WGLForwarder::wcgmGetProcAddress(file, line, name);
    }

private:
    static char const *WINAPI Text(HDC) { return "WGL_ARB_extensions_string"; }
};

ExtensionManager &Record() {
    return *ExtensionManager::Instance();
}

class FilteringTest : public OffscreenTest {
protected:
    void SetUp() override {
        contexts_ = std::make_unique<ContextCounter>();
        OffscreenTest::SetUp();
        alive_ = ContextCounter::Alive();
        made_ = ContextCounter::Made();
        current_ = ::wglGetCurrentContext();
    }

    void TearDown() override {
        EXPECT_EQ(alive_, ContextCounter::Alive());
        EXPECT_EQ(1u, InternalWindowClasses().size()); // of the test's context
        EXPECT_EQ(current_, ::wglGetCurrentContext());
        OffscreenTest::TearDown();
        contexts_.reset();
    }

    bool hasMadeContexts() const { return ContextCounter::Made() > made_; }

private:
    std::unique_ptr<ContextCounter> contexts_;
    int alive_ = 0;
    int made_ = 0;
    HGLRC current_ = nullptr;
};

} // namespace

TEST_F(FilteringTest, DrawsOnceAndLeavesNothingBehind) {
    ASSERT_TRUE(Record().supportsFloatingPointTextures());
    ASSERT_TRUE(Record().isSupported(WGL_ARB_RENDER_TEXTURE));
    HDC const currentDC = ::wglGetCurrentDC();
    GLint viewport[4], viewportAfter[4];
    ::glGetIntegerv(GL_VIEWPORT, viewport);

    Pushed<CountingForwarder> calls;
    EXPECT_TRUE(Record().supportsFloatFiltering()); // as this platform's rasterizer does
    EXPECT_EQ(2, calls->count("End"));
    EXPECT_TRUE(hasMadeContexts());
    EXPECT_EQ(calls->count("GenTextures"), calls->count("DeleteTextures"));
    EXPECT_EQ(1, calls->count("DeleteFramebuffersEXT"));
    if (Record().isSupported(GL_EXT_GPU_SHADER4)) {
        EXPECT_TRUE(Record().supportsHalfFiltering());
        EXPECT_EQ(4, calls->count("End"));
    }

    calls->reset();
    EXPECT_TRUE(Record().supportsFloatFiltering());
    Record().supportsHalfFiltering();
    EXPECT_EQ(0, calls->total());

    EXPECT_EQ(currentDC, ::wglGetCurrentDC());
    ::glGetIntegerv(GL_VIEWPORT, viewportAfter);
    EXPECT_TRUE(std::equal(viewport, viewport + 4, viewportAfter));
    EXPECT_TRUE(context().isSharingWithCurrentContext()); // the adopted twin left the group
}

TEST_F(FilteringTest, SeesANearestFilter) {
    Pushed<Obstacle> obstacle;
    obstacle->filters = false;
    EXPECT_FALSE(Record().supportsFloatFiltering());
    obstacle->filters = true;
    EXPECT_FALSE(Record().supportsFloatFiltering()) << "the answer is kept";
}

TEST_F(FilteringTest, AnswersNoWhenItFailsHalfWay) {
    Pushed<Obstacle> obstacle;
    obstacle->fails = true;
    EXPECT_FALSE(Record().supportsFloatFiltering());
    EXPECT_TRUE(hasMadeContexts());
    obstacle->fails = false;
    EXPECT_FALSE(Record().supportsFloatFiltering()) << "the answer is kept";
}

TEST(FilteringWithoutRenderTexture, AnswersNoWithoutDrawing) {
    AutoInitializer const library;
    auto hidden = std::make_unique<FewWGLExtensions>();
    ContextOffscreen const context;
    hidden.reset();
    context.makeCurrent();
    ASSERT_FALSE(Record().isSupported(WGL_ARB_RENDER_TEXTURE));
    ASSERT_TRUE(Record().supportsFloatingPointTextures());
    Pushed<CountingForwarder> calls;
    EXPECT_FALSE(Record().supportsFloatFiltering());
    EXPECT_FALSE(Record().supportsHalfFiltering());
    EXPECT_EQ(0, calls->total());
}
