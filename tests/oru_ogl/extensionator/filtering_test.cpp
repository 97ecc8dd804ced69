// The test by drawing of whether floating-point textures are filtered.
#include "tests/support/contexts.h"

#include "oru/core/exceptions/internalexception.h"

using namespace oru_test;

namespace {

/// Filters nothing, or fails in the middle of the drawing.
struct Obstacle : OpenGLForwarder {
    bool fails = false;

    void cgmTexParameteri(char const *file, unsigned int line, GLenum target, GLenum pname,
                          GLint param) override {
        OpenGLForwarder::cgmTexParameteri(file, line, target, pname,
                                          param == GL_LINEAR ? GL_NEAREST : param);
    }
    void cgmTexCoord2f(char const *file, unsigned int line, GLfloat s, GLfloat t) override {
        if (fails && s > 0)
            throw ORU::InternalException(file, static_cast<int>(line), "an obstacle");
        OpenGLForwarder::cgmTexCoord2f(file, line, s, t);
    }
};

/// After each test nothing is left of the contexts that it drew in.
class FilteringTest : public OffscreenTest {
protected:
    void TearDown() override {
        EXPECT_EQ(4, ContextCounter::Made())
            << "one for the record, the host's, and two to draw in";
        EXPECT_EQ(1u, ContextCounter::Alive());
        EXPECT_EQ(1, InternalWindows());
        EXPECT_EQ(context().renderContext(), ::wglGetCurrentContext());
        EXPECT_THROW(ORU_GL(Enable, 0x1234), ExceptionOGL) << "errors are reported as before";
        OffscreenTest::TearDown();
    }

private:
    InterceptorScope<ContextCounter> counter_;
};

} // namespace

TEST_F(FilteringTest, DrawsOnceAndLeavesNothingBehind) {
    ExtensionManager &record = *ExtensionManager::Instance();
    InterceptorScope<CountingForwarder> calls;
    for (int i = 0; i < 2; ++i)
        EXPECT_TRUE(record.supportsFloatFiltering() && record.supportsHalfFiltering());
    EXPECT_EQ(4, calls->count("End"));
    EXPECT_EQ(4, calls->count("DeleteTextures"));
    EXPECT_EQ(2, calls->count("DeleteFramebuffersEXT"));
    EXPECT_TRUE(context().isSharingWithCurrentContext()) << "the adopted twin left the group";
}

TEST_F(FilteringTest, KeepsANo) {
    ExtensionManager &record = *ExtensionManager::Instance();
    {
        InterceptorScope<Obstacle> obstacle;
        EXPECT_FALSE(record.supportsFloatFiltering());
        obstacle->fails = true;
        EXPECT_FALSE(record.supportsHalfFiltering());
    }
    EXPECT_FALSE(record.supportsFloatFiltering() || record.supportsHalfFiltering());
}
