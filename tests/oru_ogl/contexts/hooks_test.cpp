// The memory hooks see every object of the OpenGL layer come and go.
#include "testwindow.h"

#include "oru/core/memory/orumemory.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <new>

using namespace ORU::OGL;
using oru_test::TestWindow;

namespace {

int gOutstanding = 0;
int gAllocations = 0;
int gFailAt = 0; ///< the allocation that fails, counted from 1; 0 for none

void *Allocate(std::size_t size, ORU::MemoryType, char const *file, int line) {
    EXPECT_EQ(0, std::strncmp(file, "oru/", 4)) << file;
    EXPECT_GT(line, 0);
    if (++gAllocations == gFailAt)
        throw std::bad_alloc();
    ++gOutstanding;
    return std::malloc(size);
}

void Free(void *p, ORU::MemoryType, char const *, int) {
    --gOutstanding;
    std::free(p);
}

/// A round through the layer: library, record, contexts, a GL call.
void UseTheLayer() {
    AutoInitializer library;
    ContextOffscreen first, second(&first);
    first.makeCurrent();
    ORU_GL(UseProgram, 0u);
    TestWindow const window;
    // A failing context: its exception is cloned by nobody, its temporary window is freed.
    EXPECT_THROW(ContextWindowed(window.hwnd(), BufferFormat(BufferFormat::FORMAT_RGBA16F),
                                 Context::BUFFERING_DOUBLE, Context::MULTISAMPLING_NONE, nullptr),
                 ORU::LogicalException);
}

class HooksTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { ORU::SetAllocationDeallocationFunction(Allocate, Free); }
    void SetUp() override { gAllocations = gFailAt = 0; }
};

} // namespace

TEST_F(HooksTest, SeeEveryAllocationReleased) {
    UseTheLayer();
    EXPECT_GT(gAllocations, 4);
    EXPECT_EQ(0, gOutstanding);
}

// Memory runs out at each of the layer's allocations in turn: what was made before is released.
TEST_F(HooksTest, SeeEverythingReleasedWhenMemoryRunsOut) {
    UseTheLayer();
    int const count = gAllocations;
    for (int i = 1; i <= count; ++i) {
        gAllocations = 0;
        gFailAt = i;
        EXPECT_THROW(UseTheLayer(), std::bad_alloc) << i;
        EXPECT_EQ(0, gOutstanding) << "allocation " << i;
        EXPECT_EQ(nullptr, ::wglGetCurrentContext()) << "allocation " << i;
        EXPECT_TRUE(oru_test::InternalWindowClasses().empty()) << "allocation " << i;
    }
}
