// The chain through which the library makes its WGL calls.
#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/sharedptr.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

WGLInterceptor *WGLInterceptor::sInterceptor_ = nullptr;

WGLInterceptorDecorator::~WGLInterceptorDecorator() = default;

WGLInterceptor *WGLInterceptor::CreateChecker() {
    return sInterceptor_ = ORU_NEW WGLErrorChecker();
}

void WGLInterceptor::Destroy() {
    if (!sInterceptor_)
        return;
    // The check's own text is its message, so it stands as hosts know it.
    // clang-format off
    ORU_ENFORCE(dynamic_cast<WGLErrorChecker*>(sInterceptor_) != NULL);
    // clang-format on
    ORUDeleter<WGLErrorChecker>()(static_cast<WGLErrorChecker *>(sInterceptor_));
    sInterceptor_ = nullptr;
}

void WGLInterceptor::addInterceptor(WGLInterceptorDecorator *decorator) {
    decorator->setInterceptor(sInterceptor_);
    sInterceptor_ = decorator;
}

WGLInterceptorDecorator *WGLInterceptor::popInterceptor() {
    auto *const decorator = dynamic_cast<WGLInterceptorDecorator *>(sInterceptor_);
    if (decorator)
        sInterceptor_ = decorator->interceptor();
    return decorator;
}

WGLErrorChecker::~WGLErrorChecker() = default;

BOOL WGLErrorChecker::wcgmCopyContext(char const *, unsigned int, HGLRC source, HGLRC destination,
                                      UINT mask) {
    return ::wglCopyContext(source, destination, mask);
}

HGLRC WGLErrorChecker::wcgmCreateContext(char const *, unsigned int, HDC dc) {
    return ::wglCreateContext(dc);
}

HGLRC WGLErrorChecker::wcgmCreateLayerContext(char const *, unsigned int, HDC dc, int layer) {
    return ::wglCreateLayerContext(dc, layer);
}

BOOL WGLErrorChecker::wcgmDeleteContext(char const *, unsigned int, HGLRC context) {
    return ::wglDeleteContext(context);
}

HGLRC WGLErrorChecker::wcgmGetCurrentContext(char const *, unsigned int) {
    return ::wglGetCurrentContext();
}

HDC WGLErrorChecker::wcgmGetCurrentDC(char const *, unsigned int) {
    return ::wglGetCurrentDC();
}

PROC WGLErrorChecker::wcgmGetProcAddress(char const *, unsigned int, char const *name) {
    return ::wglGetProcAddress(name);
}

BOOL WGLErrorChecker::wcgmMakeCurrent(char const *, unsigned int, HDC dc, HGLRC context) {
    return ::wglMakeCurrent(dc, context);
}

BOOL WGLErrorChecker::wcgmShareLists(char const *, unsigned int, HGLRC source, HGLRC destination) {
    return ::wglShareLists(source, destination);
}

BOOL WGLErrorChecker::wcgmUseFontBitmapsA(char const *, unsigned int, HDC dc, DWORD first,
                                          DWORD count, DWORD listBase) {
    return ::wglUseFontBitmapsA(dc, first, count, listBase);
}

BOOL WGLErrorChecker::wcgmUseFontBitmapsW(char const *, unsigned int, HDC dc, DWORD first,
                                          DWORD count, DWORD listBase) {
    return ::wglUseFontBitmapsW(dc, first, count, listBase);
}

BOOL WGLErrorChecker::wcgmSwapBuffers(char const *, unsigned int, HDC dc) {
    return ::SwapBuffers(dc);
}

int WGLErrorChecker::wcgmSetLayerPaletteEntries(char const *, unsigned int, HDC dc, int layer,
                                                int start, int count, COLORREF const *entries) {
    return ::wglSetLayerPaletteEntries(dc, layer, start, count, entries);
}

int WGLErrorChecker::wcgmGetLayerPaletteEntries(char const *, unsigned int, HDC dc, int layer,
                                                int start, int count, COLORREF *entries) {
    return ::wglGetLayerPaletteEntries(dc, layer, start, count, entries);
}

BOOL WGLErrorChecker::wcgmRealizeLayerPalette(char const *, unsigned int, HDC dc, int layer,
                                              BOOL realize) {
    return ::wglRealizeLayerPalette(dc, layer, realize);
}

BOOL WGLErrorChecker::wcgmSwapLayerBuffers(char const *, unsigned int, HDC dc, UINT planes) {
    return ::wglSwapLayerBuffers(dc, planes);
}

BOOL WGLErrorChecker::wcgmUseFontOutlinesA(char const *, unsigned int, HDC dc, DWORD first,
                                           DWORD count, DWORD listBase, FLOAT deviation,
                                           FLOAT extrusion, int format,
                                           _GLYPHMETRICSFLOAT *metrics) {
    return ::wglUseFontOutlinesA(dc, first, count, listBase, deviation, extrusion, format, metrics);
}

BOOL WGLErrorChecker::wcgmUseFontOutlinesW(char const *, unsigned int, HDC dc, DWORD first,
                                           DWORD count, DWORD listBase, FLOAT deviation,
                                           FLOAT extrusion, int format,
                                           _GLYPHMETRICSFLOAT *metrics) {
    return ::wglUseFontOutlinesW(dc, first, count, listBase, deviation, extrusion, format, metrics);
}

BOOL WGLErrorChecker::wcgmDescribeLayerPlane(char const *, unsigned int, HDC dc, int pixelFormat,
                                             int layer, UINT bytes,
                                             tagLAYERPLANEDESCRIPTOR *descriptor) {
    return ::wglDescribeLayerPlane(dc, pixelFormat, layer, bytes, descriptor);
}

DWORD WGLErrorChecker::wcgmSwapMultipleBuffers(char const *, unsigned int, UINT count,
                                               _WGLSWAP const *swaps) {
    return ::wglSwapMultipleBuffers(count, swaps);
}

} // namespace ORU::OGL
