// Rendering contexts on Windows: making them current, and their end.
#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/ogl/context.h"
#include "oru/oru_ogl/ogl/internal/contexts/makecurrent_win.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

void Context::makeCurrent() const {
    internal::MakeCurrent(__FILE__, __LINE__, deviceContext_, renderContext_);
}

HGLRC Context::CurrentContext() {
    return ORU_WGL0(GetCurrentContext);
}

void Context::swapBuffers() {
    ORU_WGL(SwapBuffers, deviceContext_);
}

void Context::getBitDepths(int *red, int *green, int *blue, int *alpha, int *stencil,
                           int *depth) const {
    PIXELFORMATDESCRIPTOR descriptor = {};
    ::DescribePixelFormat(deviceContext_, ::GetPixelFormat(deviceContext_), sizeof descriptor,
                          &descriptor);
    *red = descriptor.cRedBits;
    *green = descriptor.cGreenBits;
    *blue = descriptor.cBlueBits;
    *alpha = descriptor.cAlphaBits;
    *stencil = descriptor.cStencilBits;
    *depth = descriptor.cDepthBits;
}

bool Context::SupportsVerticalRetraceControl() {
    ExtensionManager const *const manager = ExtensionManager::Instance(ORU_WGL0(GetCurrentContext));
    return manager && manager->isSupported(WGL_EXT_SWAP_CONTROL);
}

void Context::registerWithExtensionMgr() {
    if (renderContext_)
        ExtensionManager::RegisterContext(*this);
}

void Context::unregisterWithExtensionMgr() {
    if (renderContext_)
        ExtensionManager::UnRegisterContext(*this);
}

void Context::publish(Context const *share) {
    bool isRegistered = false;
    try {
        ExtensionManager::RegisterContext(*this);
        isRegistered = true;
        addShareContext(share);
    } catch (...) {
        if (isRegistered)
            ExtensionManager::UnRegisterContext(*this);
        destroyContext();
        renderContext_ = nullptr;
        throw;
    }
}

void Context::destroyContext() {
    HDC const currentDC = ORU_WGL0(GetCurrentDC);
    HGLRC const current = ORU_WGL0(GetCurrentContext);
    if (current && !ORU_WGL(MakeCurrent, nullptr, nullptr))
        ORU_THROW_INTERNAL("Context::destroyContext() failed to release context");
    if (!ORU_WGL(DeleteContext, renderContext_))
        ORU_THROW_INTERNAL("Context::destroyContext() failed to delete rendering context");
    if (current && current != renderContext_ && !ORU_WGL(MakeCurrent, currentDC, current))
        // Whatever the kind of the context: the check's text is what hosts see.
        ORU_ASSERT(!"ContextOffscreen::destroyContext() failed to restore context");
}

} // namespace ORU::OGL
