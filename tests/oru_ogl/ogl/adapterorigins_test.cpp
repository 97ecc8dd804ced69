// How often contexts ask DXGI, which costs more than all the rest of making one.
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"

#include <dxgi.h>
#include <gtest/gtest.h>

using namespace ORU::OGL;

namespace {

int gFactories = 0;

} // namespace

// The linker calls the first for CreateDXGIFactory1, and the second is the system's own.
// NOLINTBEGIN(bugprone-reserved-identifier)
extern "C" HRESULT WINAPI __real_CreateDXGIFactory1(REFIID id, void **factory);

extern "C" HRESULT WINAPI __wrap_CreateDXGIFactory1(REFIID id, void **factory) {
    ++gFactories;
    return __real_CreateDXGIFactory1(id, factory);
}
// NOLINTEND(bugprone-reserved-identifier)

TEST(AdapterOrigins, AreAskedForOnce) {
    AutoInitializer library;
    ContextOffscreen const first;
    EXPECT_EQ(1, gFactories) << "the look for the primary display serves record and context";
    ContextOffscreen const second(&first);
    ContextOffscreen const third;
    EXPECT_EQ(1, gFactories) << "the monitors are as they were";
    Context::NumDisplayDevice();
    EXPECT_EQ(2, gFactories) << "the host's own question is asked anew";
}
