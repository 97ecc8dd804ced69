// The code of the chapter on contexts.
#include "oru/core/exceptions/logicalexception.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"
#include "oru/oru_ogl/ogl/contextwrapped_win.h"
#include "oru/oru_ogl/ogl/oruopengl.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <array>
#include <future>
#include <memory>
#include <string>
#include <vector>

using namespace ORU::OGL;

namespace {

// [window]
HWND makeWindow(int width, int height) {
    WNDCLASSW kind = {};
    kind.style = CS_OWNDC; // one device context, however many contexts are made on it
    kind.lpfnWndProc = &::DefWindowProcW;
    kind.hInstance = ::GetModuleHandleW(nullptr);
    kind.lpszClassName = L"picture";
    ::RegisterClassW(&kind); // a second time it refuses, which does no harm
    return ::CreateWindowW(kind.lpszClassName, L"A picture", WS_OVERLAPPEDWINDOW, CW_USEDEFAULT,
                           CW_USEDEFAULT, width, height, nullptr, nullptr, kind.hInstance, nullptr);
}
// [window]

// [samples]
std::unique_ptr<ContextWindowed> makeContext(HWND window) {
    BufferFormat const format(BufferFormat::FORMAT_RGBA8_D24S8);
    for (int const samples : {8, 4}) {
        try {
            return std::make_unique<ContextWindowed>(window, format, Context::BUFFERING_DOUBLE,
                                                     Context::Multisampling(samples), nullptr);
        } catch (ORU::LogicalException const &) {
            // The driver has no such format: ask for less.
        }
    }
    return std::make_unique<ContextWindowed>(window, format, Context::BUFFERING_DOUBLE,
                                             Context::MULTISAMPLING_NONE, nullptr);
}
// [samples]

// [frame]
void drawFrame(ContextWindowed &context) {
    RECT inside;
    if (!::GetClientRect(context.hWnd(), &inside) || inside.right == 0 || inside.bottom == 0)
        return; // minimised: nothing is to be seen
    context.makeCurrent();
    ORU_GL(Viewport, 0, 0, inside.right, inside.bottom);
    ORU_GL(ClearColor, 0.f, 0.5f, 1.f, 1.f);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    context.swapBuffers();
}
// [frame]

class ContextsGuide : public ::testing::Test {
protected:
    ContextsGuide() : window_(makeWindow(300, 200)) {}
    ~ContextsGuide() override { ::DestroyWindow(window_); }

    AutoInitializer library_;
    HWND window_;
};

} // namespace

TEST_F(ContextsGuide, AsksForAContext) {
    // [attributes]
    ExtensionManager::InitOptions options;
    options.setContextAttributes(
        ContextAttributes().setVersion(3, 3).setProfile(OPENGLPROFILE_CORE).setDebug());
    ExtensionManager::ScopedInitOptions const scope(options);
    ContextOffscreen context;
    context.makeCurrent();
    // [attributes]
    GLint profile = 0, flags = 0;
    ::glGetIntegerv(GL_CONTEXT_PROFILE_MASK, &profile);
    ::glGetIntegerv(GL_CONTEXT_FLAGS, &flags);
    EXPECT_EQ(GL_CONTEXT_CORE_PROFILE_BIT, profile);
    EXPECT_EQ(GL_CONTEXT_FLAG_DEBUG_BIT, flags);

    std::string told;
    // [refused]
    options.setContextAttributes(ContextAttributes().setVersion(9, 9).setDebug());
    ExtensionManager::SetInitOptions(options);
    try {
        ContextOffscreen impossible;
    } catch (ORU::LogicalException const &e) {
        told = e.message(); // "No context of OpenGL 9.9, debug: the driver refuses OpenGL 9.9 …"
    }
    // [refused]
    EXPECT_EQ(0u, told.find("No context of OpenGL 9.9, debug: the driver refuses OpenGL 9.9 "));
}

TEST_F(ContextsGuide, DrawsInAWindow) {
    auto const context = makeContext(window_);
    ::SetWindowPos(window_, nullptr, 0, 0, 250, 150, SWP_NOMOVE | SWP_NOZORDER);
    drawFrame(*context);
    RECT inside;
    ::GetClientRect(window_, &inside);
    std::array<GLint, 4> viewport;
    ::glGetIntegerv(GL_VIEWPORT, viewport.data());
    EXPECT_EQ((std::array<GLint, 4>{0, 0, inside.right, inside.bottom}), viewport);

    // [bits]
    int red, green, blue, alpha, stencil, depth;
    context->getBitDepths(&red, &green, &blue, &alpha, &stencil, &depth);
    // [bits]
    EXPECT_LE(8, green);
    EXPECT_LE(24, depth);

    // [vsync]
    if (Context::SupportsVerticalRetraceControl())
        context->enableSyncToVerticalRetrace(true);
    // [vsync]
}

TEST_F(ContextsGuide, ChoosesAnAdapter) {
    // [adapters]
    std::vector<DisplayDeviceKey> devices;
    DisplayDeviceKey key;
    for (std::size_t index = 0; index < 16; ++index) // adapters without a display count, too
        if (Context::DisplayDevice(index, key))
            devices.push_back(key); // key.adapterName: what a user would choose by
    // [adapters]
    ASSERT_EQ(Context::NumDisplayDevice(), devices.size());
    // [on-adapter]
    ContextOffscreen context(devices.back());
    context.makeCurrent();
    std::string const renderer = GetGLString(GL_RENDERER); // which driver it is in truth
    // [on-adapter]
    EXPECT_FALSE(renderer.empty());
}

TEST_F(ContextsGuide, AdoptsTheContextOfAToolkit) {
    HDC const dc = ::GetDC(window_);
    PIXELFORMATDESCRIPTOR wanted = {};
    wanted.nSize = sizeof wanted;
    wanted.nVersion = 1;
    wanted.dwFlags = PFD_DRAW_TO_WINDOW | PFD_SUPPORT_OPENGL | PFD_DOUBLEBUFFER;
    wanted.cColorBits = 24;
    ASSERT_TRUE(::SetPixelFormat(dc, ::ChoosePixelFormat(dc, &wanted), &wanted));
    HGLRC const toolkits = ::wglCreateContext(dc);
    ASSERT_TRUE(::wglMakeCurrent(dc, toolkits));
    {
        // [adopt]
        // The toolkit's context is current on this thread.
        ContextWrapped const adopted;
        Texture2D picture(Texture::INTERNALFORMAT_RGBA8, 64, 64, false); // lives in it
        ContextOffscreen worker(&adopted);                               // shares it
        // [adopt]
        EXPECT_EQ(toolkits, Context::CurrentContext());
        worker.makeCurrent();
        EXPECT_TRUE(adopted.isSharingWithCurrentContext());
        EXPECT_TRUE(::glIsTexture(picture.objectID()));
    }
    EXPECT_TRUE(::wglMakeCurrent(dc, toolkits)) << "it is still the toolkit's";
    ::wglMakeCurrent(nullptr, nullptr);
    ::wglDeleteContext(toolkits);
    ::ReleaseDC(window_, dc);
}

TEST_F(ContextsGuide, WorksOnAnotherThread) {
    ContextOffscreen context;
    context.makeCurrent();
    std::vector<unsigned char> const pixels(256, 100);
    // [worker]
    ContextOffscreen uploader(&context); // made and destroyed here, used on the other thread
    auto uploaded = std::async(std::launch::async, [&] {
        ScopedContextWrapper const release; // no context is current on the thread afterwards
        uploader.makeCurrent();
        Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 8, 8, false);
        TextureUnit::Unit(0)->bind(&texture);
        texture.subImage(0, 0, 0, 8, 8, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                         pixels.data(), PixelUnpackParameters());
        ORU_GL0(Finish); // the other context finds the pixels complete
        return texture;
    });
    Texture2D texture = uploaded.get(); // or what the thread threw
    TextureUnit::Unit(0)->bind(&texture);
    // [worker]
    std::vector<unsigned char> read(pixels.size());
    texture.getPixelData(read.data(), 0, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 1);
    EXPECT_EQ(pixels, read);
}
