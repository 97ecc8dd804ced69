// Calls that the library makes in place while nobody listens, which shows in their time alone.
#include "tests/support/failure.h"
#include "tests/support/glfixture.h"

#include "oru/oru_ogl/extensionator/internal/currentcontext.h"
#include "oru/oru_ogl/extensionator/internal/openglerrorcheck.h"
#include "oru/oru_ogl/extensionator/wgl/wglforwarder.h"
#include "oru/oru_ogl/ogl/switchscope.h"

using namespace ORU::OGL;

namespace {

/// Counts the questions for the current context.
struct Listener : WGLForwarder {
    int questions = 0;

    HGLRC wcgmGetCurrentContext(char const *file, unsigned int line) override {
        ++questions;
        return WGLForwarder::wcgmGetCurrentContext(file, line);
    }
};

/// Counts the switches that are asked for.
struct Watcher : OpenGLForwarder {
    int questions = 0;

    GLboolean cgmIsEnabled(char const *file, unsigned int line, GLenum capability) override {
        ++questions;
        return OpenGLForwarder::cgmIsEnabled(file, line, capability);
    }
};

} // namespace

class PlainChainTest : public oru_test::OffscreenTest {};

TEST_F(PlainChainTest, LetsEveryDecoratorSeeTheLibrarysCalls) {
    auto const work = [] { TemporarySwitchScope const scope(GL_BLEND, false); };
    auto const misuse = [] { TemporarySwitchScope const scope(0x1234, true); };
    EXPECT_NE(std::string::npos, oru_test::FailureOf(misuse).file.find("switchscope.cpp"));
    {
        InterceptorScope<Watcher> watcher;
        work();
        EXPECT_EQ(1, watcher->questions);
        EXPECT_NE(std::string::npos, oru_test::FailureOf(misuse).file.find("switchscope.cpp"));
    }
    InterceptorScope<Listener> listener;
    ORU_GL(UseProgram, 0u);
    EXPECT_EQ(1, listener->questions) << "whose table to call through";
}

// OpenGL allows no query of errors between glBegin and glEnd, where the chain makes none.
TEST_F(PlainChainTest, GoesThroughTheChainBetweenBeginAndEnd) {
    EXPECT_TRUE(internal::IsOpenGLChainPlain());
    ORU_GL(Begin, GL_POINTS);
    EXPECT_FALSE(internal::IsOpenGLChainPlain());
    { InterceptorScope<OpenGLForwarder> const decorator; }
    EXPECT_FALSE(internal::IsOpenGLChainPlain());
    ORU_GL0(End);
    EXPECT_TRUE(internal::IsOpenGLChainPlain());
}
