// A WGL decorator that only forwards, to derive from.
#pragma once

#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"

namespace ORU::OGL {

/// Forwards every operation to the next link. Override the operations of interest and call
/// `WGLForwarder::wcgm<Name>` from them to go on along the chain.
class WGLForwarder : public WGLInterceptorDecorator {
public:
    using WGLInterceptorDecorator::WGLInterceptorDecorator;

    BOOL wcgmCopyContext(char const *file, unsigned int line, HGLRC source, HGLRC destination,
                         UINT mask) override {
        return interceptor()->wcgmCopyContext(file, line, source, destination, mask);
    }
    HGLRC wcgmCreateContext(char const *file, unsigned int line, HDC dc) override {
        return interceptor()->wcgmCreateContext(file, line, dc);
    }
    HGLRC wcgmCreateLayerContext(char const *file, unsigned int line, HDC dc, int layer) override {
        return interceptor()->wcgmCreateLayerContext(file, line, dc, layer);
    }
    BOOL wcgmDeleteContext(char const *file, unsigned int line, HGLRC rc) override {
        return interceptor()->wcgmDeleteContext(file, line, rc);
    }
    HGLRC wcgmGetCurrentContext(char const *file, unsigned int line) override {
        return interceptor()->wcgmGetCurrentContext(file, line);
    }
    HDC wcgmGetCurrentDC(char const *file, unsigned int line) override {
        return interceptor()->wcgmGetCurrentDC(file, line);
    }
    PROC wcgmGetProcAddress(char const *file, unsigned int line, char const *name) override {
        return interceptor()->wcgmGetProcAddress(file, line, name);
    }
    BOOL wcgmMakeCurrent(char const *file, unsigned int line, HDC dc, HGLRC rc) override {
        return interceptor()->wcgmMakeCurrent(file, line, dc, rc);
    }
    BOOL wcgmShareLists(char const *file, unsigned int line, HGLRC source,
                        HGLRC destination) override {
        return interceptor()->wcgmShareLists(file, line, source, destination);
    }
    BOOL wcgmUseFontBitmapsA(char const *file, unsigned int line, HDC dc, DWORD first, DWORD count,
                             DWORD base) override {
        return interceptor()->wcgmUseFontBitmapsA(file, line, dc, first, count, base);
    }
    BOOL wcgmUseFontBitmapsW(char const *file, unsigned int line, HDC dc, DWORD first, DWORD count,
                             DWORD base) override {
        return interceptor()->wcgmUseFontBitmapsW(file, line, dc, first, count, base);
    }
    BOOL wcgmSwapBuffers(char const *file, unsigned int line, HDC dc) override {
        return interceptor()->wcgmSwapBuffers(file, line, dc);
    }
    int wcgmSetLayerPaletteEntries(char const *file, unsigned int line, HDC dc, int layer,
                                   int start, int count, COLORREF const *entries) override {
        return interceptor()->wcgmSetLayerPaletteEntries(file, line, dc, layer, start, count,
                                                         entries);
    }
    int wcgmGetLayerPaletteEntries(char const *file, unsigned int line, HDC dc, int layer,
                                   int start, int count, COLORREF *entries) override {
        return interceptor()->wcgmGetLayerPaletteEntries(file, line, dc, layer, start, count,
                                                         entries);
    }
    BOOL wcgmRealizeLayerPalette(char const *file, unsigned int line, HDC dc, int layer,
                                 BOOL realize) override {
        return interceptor()->wcgmRealizeLayerPalette(file, line, dc, layer, realize);
    }
    BOOL wcgmSwapLayerBuffers(char const *file, unsigned int line, HDC dc, UINT planes) override {
        return interceptor()->wcgmSwapLayerBuffers(file, line, dc, planes);
    }
};

} // namespace ORU::OGL
