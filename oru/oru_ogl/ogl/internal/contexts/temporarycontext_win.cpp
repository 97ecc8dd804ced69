// The short-lived context on which a pixel format is searched while no context is current.
#include "oru/oru_ogl/ogl/internal/contexts/temporarycontext_win.h"

#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/ogl/internal/contexts/makecurrent_win.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL::internal {

TemporaryContext::~TemporaryContext() {
    DropExceptions([this] { release(); });
}

HDC TemporaryContext::makeWindow() {
    window_ = MakeScoped(ORU_NEW InternalWindow(0, 0));
    return deviceContext_ = ::GetDC(window_->hWnd());
}

void TemporaryContext::adopt(HGLRC context) {
    renderContext_ = context;
    MakeCurrent(__FILE__, __LINE__, deviceContext_, renderContext_);
}

bool TemporaryContext::release() {
    if (renderContext_)
        ORU_WGL(MakeCurrent, nullptr, nullptr);
    return destroy();
}

bool TemporaryContext::destroy() {
    bool isDeleted = true;
    if (renderContext_) {
        isDeleted = ORU_WGL(DeleteContext, renderContext_) != FALSE;
        renderContext_ = nullptr;
    }
    window_.reset();
    return isDeleted;
}

} // namespace ORU::OGL::internal
