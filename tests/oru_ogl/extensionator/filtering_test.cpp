// The test by drawing of whether floating-point textures are filtered.
#include "tests/support/contexts.h"
#include "tests/support/glfixture.h"

#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

using namespace ORU::OGL;
using namespace oru_test;

namespace {

/// Filters nothing, or fails in the middle of the drawing.
class Obstacle : public OpenGLForwarder {
public:
    bool filters = false;
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
        EXPECT_EQ(made_ + 2, ContextCounter::Made());
        EXPECT_EQ(1u, ContextCounter::Alive());
        EXPECT_EQ(1, InternalWindows());
        EXPECT_EQ(context().renderContext(), ::wglGetCurrentContext());
        EXPECT_EQ(context().deviceContext(), ::wglGetCurrentDC());
        EXPECT_THROW(ORU_GL(Enable, 0x1234), ExceptionOGL) << "errors are reported as before";
        OffscreenTest::TearDown();
    }

private:
    void SetUp() override {
        OffscreenTest::SetUp();
        made_ = ContextCounter::Made();
    }

    InterceptorScope<ContextCounter> counter_;
    int made_ = 0;
};

} // namespace

TEST_F(FilteringTest, DrawsOnceAndLeavesNothingBehind) {
    ASSERT_TRUE(Record().isSupported(GL_EXT_GPU_SHADER4));
    InterceptorScope<CountingForwarder> calls;
    EXPECT_TRUE(Record().supportsFloatFiltering()); // as this platform's rasterizer does
    EXPECT_TRUE(Record().supportsHalfFiltering());
    EXPECT_EQ(4, calls->count("End"));
    EXPECT_EQ(4, calls->count("DeleteTextures"));
    EXPECT_EQ(2, calls->count("DeleteFramebuffersEXT"));

    calls->reset();
    EXPECT_TRUE(Record().supportsFloatFiltering());
    EXPECT_TRUE(Record().supportsHalfFiltering());
    EXPECT_EQ(0, calls->total());
    GLint viewport[4];
    ::glGetIntegerv(GL_VIEWPORT, viewport);
    EXPECT_NE(32, viewport[2]) << "the viewport of the drawing is not the host's";
    EXPECT_TRUE(context().isSharingWithCurrentContext()) << "the adopted twin left the group";
}

TEST_F(FilteringTest, KeepsANo) {
    InterceptorScope<Obstacle> obstacle;
    EXPECT_FALSE(Record().supportsFloatFiltering());
    obstacle->fails = true;
    EXPECT_FALSE(Record().supportsHalfFiltering());
    obstacle->filters = true;
    obstacle->fails = false;
    EXPECT_FALSE(Record().supportsFloatFiltering());
    EXPECT_FALSE(Record().supportsHalfFiltering());
}
