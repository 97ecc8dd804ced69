// The test by drawing of whether floating-point textures are filtered.
#include "tests/support/glfixture.h"
#include "tests/support/testwindow.h"

#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

#include <algorithm>
#include <utility>

using namespace ORU::OGL;
using oru_test::ContextCounter;
using oru_test::CountingForwarder;
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

ExtensionManager &Record() {
    return *ExtensionManager::Instance();
}

/// After each test nothing is left of the contexts that it drew in.
class FilteringTest : public OffscreenTest {
protected:
    void TearDown() override {
        EXPECT_LT(made_, ContextCounter::Made());
        EXPECT_EQ(alive_, ContextCounter::Alive());
        EXPECT_EQ(1u, oru_test::InternalWindowClasses().size()); // of the test's context
        EXPECT_EQ(current_, std::make_pair(::wglGetCurrentContext(), ::wglGetCurrentDC()));
        EXPECT_THROW(ORU_GL(Enable, 0x1234), ExceptionOGL) << "errors are reported as before";
        OffscreenTest::TearDown();
    }

private:
    void SetUp() override {
        OffscreenTest::SetUp();
        alive_ = ContextCounter::Alive();
        made_ = ContextCounter::Made();
        current_ = {::wglGetCurrentContext(), ::wglGetCurrentDC()};
    }

    ContextCounter counter_;
    int alive_ = 0;
    int made_ = 0;
    std::pair<HGLRC, HDC> current_;
};

} // namespace

TEST_F(FilteringTest, DrawsOnceAndLeavesNothingBehind) {
    ASSERT_TRUE(Record().isSupported(GL_EXT_GPU_SHADER4));
    GLint viewport[4], viewportAfter[4];
    ::glGetIntegerv(GL_VIEWPORT, viewport);
    Pushed<CountingForwarder> calls;
    EXPECT_TRUE(Record().supportsFloatFiltering()); // as this platform's rasterizer does
    EXPECT_EQ(2, calls->count("End"));
    EXPECT_EQ(2, calls->count("DeleteTextures"));
    EXPECT_EQ(1, calls->count("DeleteFramebuffersEXT"));
    EXPECT_TRUE(Record().supportsHalfFiltering());
    EXPECT_EQ(4, calls->count("End"));

    calls->reset();
    EXPECT_TRUE(Record().supportsFloatFiltering());
    EXPECT_TRUE(Record().supportsHalfFiltering());
    EXPECT_EQ(0, calls->total());
    ::glGetIntegerv(GL_VIEWPORT, viewportAfter);
    EXPECT_TRUE(std::equal(viewport, viewport + 4, viewportAfter));
    EXPECT_TRUE(context().isSharingWithCurrentContext()); // the adopted twin left the group
}

TEST_F(FilteringTest, KeepsANo) {
    Pushed<Obstacle> obstacle;
    obstacle->filters = false;
    EXPECT_FALSE(Record().supportsFloatFiltering());
    obstacle->fails = true;
    EXPECT_FALSE(Record().supportsHalfFiltering());
    obstacle->filters = true;
    obstacle->fails = false;
    EXPECT_FALSE(Record().supportsFloatFiltering());
    EXPECT_FALSE(Record().supportsHalfFiltering());
}
