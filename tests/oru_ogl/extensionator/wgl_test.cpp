// The WGL chain and the WGL extension pointers.
#include "../contexts/testwindow.h"
#include "../glfixture.h"

#include "oru/oru_ogl/extensionator/wgl/extensionswgl.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/extensionator/wgl/wglforwarder.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"

using namespace ORU::OGL;
using oru_test::MessageOf;

namespace {

/// Answers as if one entry point were missing, and notes which are asked for from which line.
class Withholder : public WGLForwarder {
public:
    explicit Withholder(std::string name) : name_(std::move(name)) {}
    PROC wcgmGetProcAddress(char const *file, unsigned int line, char const *name) override {
        asked_.emplace_back(name, line);
        return name == name_ ? nullptr : WGLForwarder::wcgmGetProcAddress(file, line, name);
    }
    std::vector<std::pair<std::string, unsigned int>> asked_;

private:
    std::string name_;
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
    EXPECT_FALSE(InitializeWGLExtension(GL_ARB_IMAGING));
    EXPECT_FALSE(InitializeWGLExtension(UNKNOWN_OPENGL_EXTENSION));
    for (OpenGLExtension const e :
         {WGL_ARB_CREATE_CONTEXT_PROFILE, WGL_ARB_MULTISAMPLE, WGL_ARB_PIXEL_FORMAT_FLOAT,
          WGL_NV_FLOAT_BUFFER, WGL_NV_RENDER_TEXTURE_RECTANGLE}) {
        Withholder asked("");
        WGLInterceptor::Instance()->addInterceptor(&asked);
        EXPECT_TRUE(InitializeWGLExtension(e)) << e;
        WGLInterceptor::Instance()->popInterceptor();
        EXPECT_TRUE(asked.asked_.empty()) << e;
    }
    EXPECT_TRUE(InitializeWGLExtension(WGL_ARB_PBUFFER));
    EXPECT_EQ(::wglGetProcAddress("wglQueryPbufferARB"),
              reinterpret_cast<PROC>(reinterpret_cast<void *>(_wcgmQueryPbufferARB)));
}

TEST_F(WGLTest, KeepsWhatItFoundOfAnIncompleteExtension) {
    _wcgmSwapIntervalEXT = nullptr;
    Withholder without("wglGetSwapIntervalEXT");
    WGLInterceptor::Instance()->addInterceptor(&without);
    EXPECT_FALSE(InitializeWGLExtension(WGL_EXT_SWAP_CONTROL));
    WGLInterceptor::Instance()->popInterceptor();
    EXPECT_EQ(nullptr, _wcgmGetSwapIntervalEXT);
    EXPECT_NE(nullptr, _wcgmSwapIntervalEXT);
    std::vector<std::pair<std::string, unsigned int>> const expected = {
        {"wglGetSwapIntervalEXT", 235}, {"wglSwapIntervalEXT", 236}};
    EXPECT_EQ(expected, without.asked_);
    EXPECT_TRUE(InitializeWGLExtension(WGL_EXT_SWAP_CONTROL));
    EXPECT_NE(nullptr, _wcgmGetSwapIntervalEXT);
}

// A record built while the driver hides an entry point lacks the extension, not its name's
// siblings.
TEST(WGLRecord, LacksAnExtensionWithoutItsEntryPoint) {
    AutoInitializer library;
    Withholder without("wglGetSwapIntervalEXT");
    WGLInterceptor::Instance()->addInterceptor(&without);
    {
        ContextOffscreen context;
        context.makeCurrent();
        ExtensionManager const &record = *ExtensionManager::Instance();
        EXPECT_FALSE(record.isSupported(WGL_EXT_SWAP_CONTROL));
        EXPECT_TRUE(record.isSupported(WGL_ARB_PBUFFER));
        EXPECT_FALSE(Context::SupportsVerticalRetraceControl());
        oru_test::TestWindow const window;
        ContextWindowed windowed(window.hwnd(), BufferFormat(BufferFormat::FORMAT_RGBA8),
                                 Context::BUFFERING_DOUBLE, Context::MULTISAMPLING_NONE, &context);
        EXPECT_EQ("ContextWindowed::enableSyncToVerticalRetrace unsupported feature",
                  MessageOf([&] { windowed.enableSyncToVerticalRetrace(true); }));
    }
    WGLInterceptor::Instance()->popInterceptor();
}
