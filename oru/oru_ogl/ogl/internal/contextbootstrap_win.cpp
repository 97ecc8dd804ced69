// The throw-away context on which a display device's capabilities are read.
#include "oru/oru_ogl/ogl/internal/contextbootstrap_win.h"

#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/internal/functioncast.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/ogl/internal/contexts/adapterorigins_win.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL::internal {

ContextBootstrap::ContextBootstrap(DisplayDeviceKey const &key) : Context(key) {
    window_ = MakeScoped(ORU_NEW InternalWindow(AdapterOrigin(key.adapterName)));
    deviceContext_ = ::GetDC(window_->hWnd());

    // Only a context that is current when this one is made can offer the function.
    auto const create = FunctionCast<PFNWGLCREATECONTEXTATTRIBSARBPROC>(
        ORU_WGL(GetProcAddress, "wglCreateContextAttribsARB"));
    if (create) {
        int const attributes[] = {WGL_CONTEXT_MAJOR_VERSION_ARB, 4, WGL_CONTEXT_MINOR_VERSION_ARB,
                                  2, 0};
        renderContext_ = create(deviceContext_, nullptr, attributes);
    }
    if (!renderContext_) {
        setPixelFormat(deviceContext_, 1);
        renderContext_ = ORU_WGL(CreateContext, deviceContext_);
    }
}

ContextBootstrap::~ContextBootstrap() {
    DropExceptions([this] {
        ORU_WGL(MakeCurrent, nullptr, nullptr);
        destroyContext();
        window_.reset();
    });
}

} // namespace ORU::OGL::internal
