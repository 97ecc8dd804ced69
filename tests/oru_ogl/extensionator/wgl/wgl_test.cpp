// The WGL chain and the WGL extension pointers.
#include "tests/support/contexts.h"
#include "tests/support/failure.h"
#include "tests/support/glfixture.h"
#include "tests/support/tablerows.h"

#include "oru/oru_ogl/extensionator/wgl/extensionswgl.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/extensionator/wgl/wglforwarder.h"

#include <set>
#include <string>
#include <utility>
#include <vector>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

/// Answers as if entry points were missing, and notes what is asked for from where.
class Withholder : public WGLForwarder {
public:
    explicit Withholder(std::set<std::string> names = {}) : names_(std::move(names)) {}

    PROC wcgmGetProcAddress(char const *file, unsigned int line, char const *name) override {
        asked.push_back(name + (':' + std::to_string(line)));
        return names_.count(name) ? nullptr : WGLForwarder::wcgmGetProcAddress(file, line, name);
    }
    std::vector<std::string> asked;

private:
    std::set<std::string> names_;
};

/// Notes the calls whose parameters do not tell them apart.
class Letters : public WGLForwarder {
public:
    BOOL wcgmUseFontBitmapsA(char const *, unsigned int, HDC, DWORD, DWORD, DWORD) override {
        return asked += 'A', TRUE;
    }
    BOOL wcgmUseFontBitmapsW(char const *, unsigned int, HDC, DWORD, DWORD, DWORD) override {
        return asked += 'W', TRUE;
    }
    std::string asked;
};

} // namespace

class WGLTest : public OffscreenTest {};

TEST_F(WGLTest, ForwardsToThePlatform) {
    EXPECT_EQ(nullptr, WGLInterceptor::Instance()->popInterceptor()) << "the checker stays";
    EXPECT_EQ(::wglGetCurrentContext(), ORU_WGL0(GetCurrentContext));
    EXPECT_EQ(::wglGetProcAddress("wglSwapIntervalEXT"),
              ORU_WGL(GetProcAddress, "wglSwapIntervalEXT"));
    EXPECT_FALSE(ORU_WGL(DeleteContext, nullptr)) << "failures come back as they are";
    InterceptorScope<Letters> letters;
    WGLForwarder decorator;
    WGLInterceptor::Instance()->addInterceptor(&decorator);
    EXPECT_FAILURE("Enforce dynamic_cast<WGLErrorChecker*>(sInterceptor_) != NULL",
                   WGLInterceptor::Destroy());
    ORU_WGL(UseFontBitmapsA, nullptr, 0u, 0u, 0u);
    ORU_WGL(UseFontBitmapsW, nullptr, 0u, 0u, 0u);
    EXPECT_EQ("AW", letters->asked);
    EXPECT_EQ(&decorator, ExtensionManager::Instance()->popWGLInterceptor());
}

TEST_F(WGLTest, LoadsEachExtension) {
    InterceptorScope<Withholder> none;
    for (unsigned int value = 0; value <= UNKNOWN_OPENGL_EXTENSION; ++value)
        EXPECT_EQ(value >= 102 && value <= 112,
                  InitializeWGLExtension(static_cast<OpenGLExtension>(value)))
            << value;
    std::vector<std::string> expected;
    for (auto const &row : TableRows(ORU_WGL_ENTRY_POINTS))
        expected.push_back(row[0] + ':' + row[2]);
    EXPECT_EQ(15u, expected.size());
    EXPECT_EQ(expected, none->asked);
#define ORU_WGL_POINTER(Result, Pointer, Parameters)                                               \
    EXPECT_EQ(::wglGetProcAddress(("wgl" + std::string(#Pointer).substr(5)).c_str()),              \
              reinterpret_cast<PROC>(reinterpret_cast<void *>(Pointer)));
#include "oru/oru_ogl/extensionator/wgl/extensionswgl_pointers.inc"
}

// What a driver lacks an entry point of is not supported; what it has of it is there all the same.
TEST(WGLRecord, LacksAnExtensionWithoutItsEntryPoint) {
    AutoInitializer const library;
    _wcgmSwapIntervalEXT = nullptr;
    InterceptorScope<Withholder> const without(
        std::set<std::string>{"wglGetSwapIntervalEXT", "wglBindTexImageARB"});
    ContextOffscreen const context;
    context.makeCurrent();
    ExtensionManager &record = *ExtensionManager::Instance();
    EXPECT_FALSE(record.isSupported(WGL_EXT_SWAP_CONTROL));
    EXPECT_TRUE(record.isSupported(WGL_ARB_PBUFFER));
    EXPECT_EQ(nullptr, _wcgmGetSwapIntervalEXT);
    EXPECT_NE(nullptr, _wcgmSwapIntervalEXT);
    EXPECT_FALSE(Context::SupportsVerticalRetraceControl());
    EXPECT_FALSE(record.supportsRenderToTexture());
    ASSERT_TRUE(record.supportsFloatingPointTextures() && record.isSupported(GL_EXT_GPU_SHADER4));
    InterceptorScope<CountingForwarder> calls;
    EXPECT_FALSE(record.supportsFloatFiltering() || record.supportsHalfFiltering());
    EXPECT_EQ(0, calls->total());
    TestWindow const window;
    ContextWindowed windowed = Windowed(window, &context);
    EXPECT_FAILURE("ContextWindowed::enableSyncToVerticalRetrace unsupported feature",
                   windowed.enableSyncToVerticalRetrace(true));
}
