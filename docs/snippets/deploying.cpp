// The code of the page on deploying.
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/oruopengl.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <string>

// NOLINTBEGIN(readability-identifier-naming): the drivers look for these names
// [hybrid]
extern "C" {
__declspec(dllexport) DWORD NvOptimusEnablement = 1;
__declspec(dllexport) int AmdPowerXpressRequestHighPerformance = 1;
}
// [hybrid]
// NOLINTEND(readability-identifier-naming)

namespace {

// [enough]
/// Why the host cannot draw on this machine, empty when it can.
std::string whyNot() {
    using namespace ORU::OGL;
    try {
        ContextOffscreen context;
        context.makeCurrent();
        ExtensionManager const &gpu = *ExtensionManager::Instance();
        if (gpu.majorVersion() < 3)
            return "OpenGL 3.0 is needed; this machine has " + GetGLString(GL_VERSION) + " by " +
                   GetGLString(GL_RENDERER);
        return "";
    } catch (ORU::LogicalException const &failure) {
        return failure.message();
    }
}
// [enough]

} // namespace

TEST(DeployingGuide, AsksForTheFastGpu) {
    HMODULE const host = ::GetModuleHandleW(nullptr);
    EXPECT_TRUE(::GetProcAddress(host, "NvOptimusEnablement"));
    EXPECT_TRUE(::GetProcAddress(host, "AmdPowerXpressRequestHighPerformance"));
}

TEST(DeployingGuide, SaysWhyNot) {
    ORU::OGL::AutoInitializer const library;
    EXPECT_EQ("", whyNot());
}
