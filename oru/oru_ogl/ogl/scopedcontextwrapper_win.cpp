// Remembering the current context for a scope, and releasing it.
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

ScopedContextWrapper::ScopedContextWrapper(bool restore)
    : deviceContext_(::wglGetCurrentDC()), renderContext_(::wglGetCurrentContext()),
      restore_(restore) {}

ScopedContextWrapper::~ScopedContextWrapper() {
    try {
        if (::wglGetCurrentContext() == renderContext_ && ::wglGetCurrentDC() == deviceContext_)
            return;
        if (!::wglMakeCurrent(deviceContext_, renderContext_))
            ORU_THROW_INTERNAL(
                ComposeText("Context::can't make this context current", ::GetLastError()));
    } catch (...) {
        // A destructor has nobody to report to.
    }
}

void ReleaseOGLContext() {
    if (::wglGetCurrentContext())
        ::wglMakeCurrent(nullptr, nullptr);
}

} // namespace ORU::OGL
