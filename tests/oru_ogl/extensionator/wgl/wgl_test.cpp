// The WGL chain and the WGL extension pointers.
#include "tests/support/failure.h"
#include "tests/support/glfixture.h"
#include "tests/support/testwindow.h"

#include "oru/oru_ogl/extensionator/wgl/extensionswgl.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/extensionator/wgl/wglforwarder.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"

#include <set>
#include <utility>
#include <vector>

using namespace ORU::OGL;
using oru_test::MessageOf;

namespace {

/// Answers for its life as if entry points were missing, and notes what is asked for from where.
class Withholder : public WGLForwarder {
public:
    explicit Withholder(std::set<std::string> names) : names_(std::move(names)) {
        WGLInterceptor::Instance()->addInterceptor(this);
    }
    ~Withholder() override { WGLInterceptor::Instance()->popInterceptor(); }

    PROC wcgmGetProcAddress(char const *file, unsigned int line, char const *name) override {
        asked_.emplace_back(name, line);
        return names_.count(name) ? nullptr : WGLForwarder::wcgmGetProcAddress(file, line, name);
    }
    std::vector<std::pair<std::string, unsigned int>> asked_;

private:
    std::set<std::string> names_;
};

} // namespace

class WGLTest : public oru_test::OffscreenTest {};

TEST_F(WGLTest, ForwardsToThePlatform) {
    EXPECT_EQ(nullptr, WGLInterceptor::Instance()->popInterceptor()) << "the checker stays";
    EXPECT_EQ(::wglGetCurrentContext(), ORU_WGL0(GetCurrentContext));
    EXPECT_EQ(::wglGetProcAddress("wglSwapIntervalEXT"),
              ORU_WGL(GetProcAddress, "wglSwapIntervalEXT"));
    EXPECT_FALSE(ORU_WGL(DeleteContext, nullptr)) << "failures come back as they are";
    WGLForwarder decorator;
    WGLInterceptor::Instance()->addInterceptor(&decorator);
    EXPECT_EQ("Enforce dynamic_cast<WGLErrorChecker*>(sInterceptor_) != NULL",
              MessageOf([] { WGLInterceptor::Destroy(); }));
    EXPECT_EQ(&decorator, ExtensionManager::Instance()->popWGLInterceptor());
}

TEST_F(WGLTest, LoadsEachExtension) {
    Withholder const none({});
    for (unsigned int value = 0; value <= UNKNOWN_OPENGL_EXTENSION; ++value)
        EXPECT_EQ(value >= 102 && value <= 112,
                  InitializeWGLExtension(static_cast<OpenGLExtension>(value)))
            << value;
    std::vector<std::pair<std::string, unsigned int>> const expected = {
        {"wglCreateContextAttribsARB", 80},
        {"wglGetExtensionsStringARB", 114},
        {"wglCreatePbufferARB", 152},
        {"wglDestroyPbufferARB", 153},
        {"wglGetPbufferDCARB", 154},
        {"wglQueryPbufferARB", 155},
        {"wglReleasePbufferDCARB", 156},
        {"wglChoosePixelFormatARB", 176},
        {"wglGetPixelFormatAttribfvARB", 177},
        {"wglGetPixelFormatAttribivARB", 178},
        {"wglBindTexImageARB", 214},
        {"wglReleaseTexImageARB", 215},
        {"wglSetPbufferAttribARB", 216},
        {"wglGetSwapIntervalEXT", 235},
        {"wglSwapIntervalEXT", 236}};
    EXPECT_EQ(expected, none.asked_);
    EXPECT_EQ(::wglGetProcAddress("wglQueryPbufferARB"),
              reinterpret_cast<PROC>(reinterpret_cast<void *>(_wcgmQueryPbufferARB)));
}

// What a driver lacks an entry point of is not supported; what it has of it is there all the same.
TEST(WGLRecord, LacksAnExtensionWithoutItsEntryPoint) {
    AutoInitializer const library;
    _wcgmSwapIntervalEXT = nullptr;
    Withholder const without({"wglGetSwapIntervalEXT", "wglBindTexImageARB"});
    ContextOffscreen context;
    context.makeCurrent();
    ExtensionManager &record = *ExtensionManager::Instance();
    EXPECT_FALSE(record.isSupported(WGL_EXT_SWAP_CONTROL));
    EXPECT_TRUE(record.isSupported(WGL_ARB_PBUFFER));
    EXPECT_EQ(nullptr, _wcgmGetSwapIntervalEXT);
    EXPECT_NE(nullptr, _wcgmSwapIntervalEXT);
    EXPECT_FALSE(Context::SupportsVerticalRetraceControl());
    EXPECT_FALSE(record.supportsRenderToTexture());
    ASSERT_TRUE(record.supportsFloatingPointTextures() && record.isSupported(GL_EXT_GPU_SHADER4));
    oru_test::Pushed<oru_test::CountingForwarder> calls;
    EXPECT_FALSE(record.supportsFloatFiltering());
    EXPECT_FALSE(record.supportsHalfFiltering());
    EXPECT_EQ(0, calls->total());
    oru_test::TestWindow const window;
    ContextWindowed windowed(window.hwnd(), BufferFormat(BufferFormat::FORMAT_RGBA8),
                             Context::BUFFERING_DOUBLE, Context::MULTISAMPLING_NONE, &context);
    EXPECT_EQ("ContextWindowed::enableSyncToVerticalRetrace unsupported feature",
              MessageOf([&] { windowed.enableSyncToVerticalRetrace(true); }));
}
