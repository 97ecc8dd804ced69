// The WGL chain and the WGL extension pointers.
#include "tests/support/contexts.h"
#include "tests/support/tablerows.h"

#include "oru/oru_ogl/extensionator/wgl/extensionswgl.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"

using namespace oru_test;

namespace {

/// Answers as if entry points were missing, and notes what is asked for from where.
struct Withholder : WGLForwarder {
    std::set<std::string> missing;
    std::vector<std::string> asked;

    PROC wcgmGetProcAddress(char const *file, unsigned int line, char const *name) override {
        asked.push_back(name + (':' + std::to_string(line)));
        return missing.count(name) ? nullptr : WGLForwarder::wcgmGetProcAddress(file, line, name);
    }
};

} // namespace

class WGLTest : public OffscreenTest {};

TEST_F(WGLTest, ForwardsToThePlatform) {
    EXPECT_EQ(nullptr, WGLInterceptor::Instance()->popInterceptor()) << "the checker stays";
    WGLForwarder decorator;
    WGLInterceptor::Instance()->addInterceptor(&decorator);
    EXPECT_FAILURE("Enforce dynamic_cast<WGLErrorChecker*>(sInterceptor_) != NULL",
                   WGLInterceptor::Destroy());
    EXPECT_FALSE(ORU_WGL(DeleteContext, nullptr)) << "failures come back as they are";
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
    InterceptorScope<Withholder> without;
    without->missing = {"wglGetSwapIntervalEXT", "wglBindTexImageARB"};
    ContextOffscreen const context;
    context.makeCurrent();
    ExtensionManager &record = *ExtensionManager::Instance();
    EXPECT_FALSE(record.isSupported(WGL_EXT_SWAP_CONTROL));
    EXPECT_TRUE(record.isSupported(WGL_ARB_PBUFFER));
    EXPECT_EQ(nullptr, _wcgmGetSwapIntervalEXT);
    EXPECT_NE(nullptr, _wcgmSwapIntervalEXT);
    EXPECT_FALSE(Context::SupportsVerticalRetraceControl());
    EXPECT_FALSE(record.supportsRenderToTexture());
}
