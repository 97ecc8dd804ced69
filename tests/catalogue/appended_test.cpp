// What is appended to the tables loads, is found by name, and takes its way through the chain.
#include "tests/support/testwindow.h"

#include "oru/oru_ogl/displaydevicekey.h"
#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/interceptorscope.h"
#include "oru/oru_ogl/extensionator/internal/contextservices.h"
#include "oru/oru_ogl/extensionator/opengltracer.h"

#include <gtest/gtest.h>

#include <sstream>

using namespace ORU::OGL;

// The library is open; no context is one of the layer above.
namespace ORU::OGL::internal {
bool IsLibraryInitialized() {
    return true;
}
DisplayDeviceKey const &DisplayDeviceOf(Context const &) {
    static DisplayDeviceKey const kNone;
    return kNone;
}
HGLRC RenderContextOf(Context const &) {
    return nullptr;
}
void MakeContextCurrent(Context const &) {}
void WithBootstrapContext(DisplayDeviceKey const &, std::function<void(Context *)> const &) {}
bool FiltersFloatsLinearly() {
    return false;
}
bool FiltersHalvesLinearly() {
    return false;
}
} // namespace ORU::OGL::internal

template<class Function>
static PROC Address(Function function) {
    return reinterpret_cast<PROC>(reinterpret_cast<void *>(function));
}

TEST(AppendedRows, LoadAndAreFoundByName) {
    oru_test::TestWindow const window; // for a rendering context of the host
    HDC const dc = ::GetDC(window.hwnd());
    PIXELFORMATDESCRIPTOR format = {};
    format.nSize = sizeof format;
    format.dwFlags = PFD_DRAW_TO_WINDOW | PFD_SUPPORT_OPENGL;
    ::SetPixelFormat(dc, ::ChoosePixelFormat(dc, &format), &format);
    HGLRC const rc = ::wglCreateContext(dc);
    ASSERT_TRUE(::wglMakeCurrent(dc, rc));
    FunctionTable const &table = ExtensionManager::CurrentTable();
    ExtensionManager &record = *ExtensionManager::Instance();
    OpenGLExtension const appended = record.nameToEnumGL("GL_ARB_compute_shader");
    EXPECT_EQ(GL_ARB_COMPUTE_SHADER, appended);
    EXPECT_LT(WGL_NV_RENDER_TEXTURE_RECTANGLE, appended);
    EXPECT_TRUE(record.isSupported(appended) && record.isSupported(WGL_ARB_PBUFFER));
    EXPECT_EQ(GL_SGIS_GENERATE_MIPMAP, record.nameToEnumGL("GL_SGIS_generate_mipmap"));

    // A group of its own, the rest of one that stands further up, the first of one that had none.
    EXPECT_EQ(::wglGetProcAddress("glDispatchCompute"), Address(table.glDispatchCompute));
    EXPECT_EQ(::wglGetProcAddress("glObjectPtrLabel"), Address(table.glObjectPtrLabel));
    EXPECT_EQ(::wglGetProcAddress("glMinSampleShadingARB"), Address(table.glMinSampleShadingARB));
    ASSERT_TRUE(table.glDispatchCompute && table.glObjectPtrLabel && table.glFenceSync);

    std::ostringstream text;
    InterceptorScope<OpenGLTracer> const tracer(text);
    EXPECT_THROW(ORU_GL(DispatchCompute, 1, 2, 3), ExceptionOGL) << "no program is in use";
    EXPECT_NE(std::string::npos, text.str().find("glDispatchCompute(1, 2, 3)"));
    ::wglMakeCurrent(nullptr, nullptr);
    ::wglDeleteContext(rc);
}
