// The code of the page on the architecture.
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/interceptorscope.h"
#include "oru/oru_ogl/extensionator/openglinterceptordecorator.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"

#include <gtest/gtest.h>

using namespace ORU::OGL;

namespace {

// [decorator]
class CallCounter : public OpenGLInterceptorDecorator {
public:
    int calls = 0;
#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    Result cgm##Name Parameters override {                                                         \
        ++calls;                                                                                   \
        return interceptor()->cgm##Name Arguments;                                                 \
    }
#include "oru/oru_ogl/extensionator/gloperations.inc"
};
// [decorator]

} // namespace

TEST(Architecture, CountsCalls) {
    AutoInitializer const library;
    ContextOffscreen const context;
    context.makeCurrent();
    // [scope]
    InterceptorScope<CallCounter> const counter;
    ORU_GL(Viewport, 0, 0, 1, 1);
    ORU_GL0(Flush);
    EXPECT_EQ(2, counter->calls);
    // [scope]
}
