// The memory hooks see every object of the OpenGL layer come and go.
#include "testwindow.h"

#include "tests/countinghooks.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"

#include <gtest/gtest.h>

using namespace ORU::OGL;

namespace {

/// A round through the layer: library, record, contexts, a GL call.
void UseTheLayer() {
    AutoInitializer library;
    ContextOffscreen first, second(&first);
    first.makeCurrent();
    ORU_GL(UseProgram, 0u);
    oru_test::TestWindow const window;
    // A failing context: its exception is cloned by nobody, its temporary window is freed.
    EXPECT_THROW(ContextWindowed(window.hwnd(), BufferFormat(BufferFormat::FORMAT_RGBA16F),
                                 Context::BUFFERING_DOUBLE, Context::MULTISAMPLING_NONE, nullptr),
                 ORU::LogicalException);
}

} // namespace

// Memory runs out at each of the layer's allocations in turn: what was made before is released.
TEST(Hooks, SeeEverythingReleasedWhenMemoryRunsOut) {
    int count = 0;
    {
        oru_test::CountingHooks hooks;
        UseTheLayer();
        count = hooks.allocations();
        EXPECT_GT(count, 4);
        EXPECT_TRUE(hooks.outstanding().empty());
        for (std::string const &file : hooks.files())
            EXPECT_EQ(0u, file.find("oru/")) << file;
    }
    for (int i = 1; i <= count; ++i) {
        oru_test::CountingHooks hooks;
        hooks.failAt(i);
        EXPECT_THROW(UseTheLayer(), std::bad_alloc) << i;
        EXPECT_TRUE(hooks.outstanding().empty()) << "allocation " << i;
        EXPECT_EQ(0, hooks.wrongReleases()) << "allocation " << i;
        EXPECT_EQ(nullptr, ::wglGetCurrentContext()) << "allocation " << i;
        EXPECT_TRUE(oru_test::InternalWindowClasses().empty()) << "allocation " << i;
    }
}
