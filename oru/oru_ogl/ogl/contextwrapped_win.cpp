// A context that somebody else made, adopted.
#include "oru/oru_ogl/ogl/contextwrapped_win.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/internal/contextregistry.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

ContextWrapped::ContextWrapped(HDC deviceContext, HGLRC renderContext, HWND window)
    : Context(renderContext) {
    adopt(deviceContext, window);
}

ContextWrapped::ContextWrapped() : Context(::wglGetCurrentContext()) {
    adopt(::wglGetCurrentDC(), nullptr);
}

void ContextWrapped::adopt(HDC deviceContext, HWND window) {
    if (!deviceContext)
        ORU_THROW_INTERNAL("ContextWrapped::ctor invalid device");
    if (!renderContext_)
        ORU_THROW_INTERNAL("ContextWrapped::ctor invalid rendering context");
    deviceContext_ = deviceContext;
    setDisplayDeviceKey(window ? DisplayDeviceFromWindow(window) : DeviceOfCurrentContext());
    ExtensionManager::RegisterContext(*this);
    RegisterContextWrapped(this);
}

DisplayDeviceKey ContextWrapped::DeviceOfCurrentContext() {
    ExtensionManager const *const record = ExtensionManager::Instance(ORU_WGL0(GetCurrentContext));
    if (record && !record->displayDeviceKey().deviceID.empty())
        return record->displayDeviceKey();
    // The context is new to the library, or known only as the host's own: its window tells.
    HWND const window = ::WindowFromDC(ORU_WGL0(GetCurrentDC));
    return window ? DisplayDeviceFromWindow(window) : PrimaryDisplayDevice();
}

ContextWrapped::~ContextWrapped() {
    DropExceptions([this] { UnregisterShareContext(this); });
    internal::ContextRegistry::LetGo(renderContext_);
}

void ContextWrapped::makeCurrent() const {
    try {
        Context::makeCurrent();
    } catch (InternalException const &) {
        ORU_THROW_INTERNAL("ContextWrapped Object leaked");
    }
}

} // namespace ORU::OGL
