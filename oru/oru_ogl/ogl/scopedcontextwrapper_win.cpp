// Remembering the current context for a scope, and releasing it.
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

ScopedContextWrapper::ScopedContextWrapper(bool restore)
    : deviceContext_(::wglGetCurrentDC()), renderContext_(::wglGetCurrentContext()),
      restore_(restore) {}

ScopedContextWrapper::~ScopedContextWrapper() {
    if (::wglGetCurrentContext() == renderContext_ && ::wglGetCurrentDC() == deviceContext_)
        return;
    // Its result is not looked at: a destructor has nobody to report to.
    ::wglMakeCurrent(deviceContext_, renderContext_);
}

void ReleaseOGLContext() {
    if (::wglGetCurrentContext())
        ::wglMakeCurrent(nullptr, nullptr);
}

} // namespace ORU::OGL
