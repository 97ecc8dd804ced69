// The chain through which the library makes its WGL calls.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/core/utility/windowsforward.h"

namespace ORU::OGL {

class WGLInterceptorDecorator;

/// A link of the WGL chain: one operation `wcgm<Name>` per WGL function `wgl<Name>`.
///
/// Each operation takes the caller's file and line in front of the WGL arguments. The last link, a
/// WGLErrorChecker, only makes the call: whoever calls tests the result. The chain is process-wide
/// and not locked.
class ORU_API WGLInterceptor {
public:
    virtual BOOL wcgmCopyContext(char const *file, unsigned int line, HGLRC source,
                                 HGLRC destination, UINT mask) = 0;
    virtual HGLRC wcgmCreateContext(char const *file, unsigned int line, HDC dc) = 0;
    virtual HGLRC wcgmCreateLayerContext(char const *file, unsigned int line, HDC dc,
                                         int layer) = 0;
    virtual BOOL wcgmDeleteContext(char const *file, unsigned int line, HGLRC context) = 0;
    virtual HGLRC wcgmGetCurrentContext(char const *file, unsigned int line) = 0;
    virtual HDC wcgmGetCurrentDC(char const *file, unsigned int line) = 0;
    virtual PROC wcgmGetProcAddress(char const *file, unsigned int line, char const *name) = 0;
    virtual BOOL wcgmMakeCurrent(char const *file, unsigned int line, HDC dc, HGLRC context) = 0;
    virtual BOOL wcgmShareLists(char const *file, unsigned int line, HGLRC source,
                                HGLRC destination) = 0;
    virtual BOOL wcgmUseFontBitmapsA(char const *file, unsigned int line, HDC dc, DWORD first,
                                     DWORD count, DWORD listBase) = 0;
    virtual BOOL wcgmUseFontBitmapsW(char const *file, unsigned int line, HDC dc, DWORD first,
                                     DWORD count, DWORD listBase) = 0;
    virtual BOOL wcgmSwapBuffers(char const *file, unsigned int line, HDC dc) = 0;
    virtual int wcgmSetLayerPaletteEntries(char const *file, unsigned int line, HDC dc, int layer,
                                           int start, int count, COLORREF const *entries) = 0;
    virtual int wcgmGetLayerPaletteEntries(char const *file, unsigned int line, HDC dc, int layer,
                                           int start, int count, COLORREF *entries) = 0;
    virtual BOOL wcgmRealizeLayerPalette(char const *file, unsigned int line, HDC dc, int layer,
                                         BOOL realize) = 0;
    virtual BOOL wcgmSwapLayerBuffers(char const *file, unsigned int line, HDC dc, UINT planes) = 0;

    /// The first link of the chain; the first call makes the WGLErrorChecker.
    static WGLInterceptor *Instance() { return sInterceptor_ ? sInterceptor_ : CreateChecker(); }

    /// Destroys the last link, so that the chain is empty.
    /// @throws InternalException when a decorator is still pushed; nothing is then destroyed
    static void Destroy();

    /// Makes a decorator the first link. It stays the caller's: pop it before it is destroyed.
    void addInterceptor(WGLInterceptorDecorator *decorator);

    /// Takes the first link off the chain when it is a decorator.
    /// @return the decorator, or null when only the last link is left
    WGLInterceptorDecorator *popInterceptor();

protected:
    WGLInterceptor() = default;
    WGLInterceptor(WGLInterceptor const &) = default;
    WGLInterceptor &operator=(WGLInterceptor const &) = default;
    ~WGLInterceptor() = default;

private:
    static WGLInterceptor *CreateChecker();

    static WGLInterceptor *sInterceptor_;
};

/// Base of WGL decorators: knows the next link. A concrete decorator implements every operation and
/// forwards it to `interceptor()`.
class ORU_API WGLInterceptorDecorator : public WGLInterceptor {
public:
    /// @param next the next link, not owned; pushing the decorator sets it anew
    explicit WGLInterceptorDecorator(WGLInterceptor *next = nullptr) : next_(next) {}
    virtual ~WGLInterceptorDecorator();

    /// The next link, null while the decorator is in no chain.
    WGLInterceptor *interceptor() { return next_; }
    WGLInterceptor const *interceptor() const { return next_; }
    void setInterceptor(WGLInterceptor *next) { next_ = next; }

private:
    WGLInterceptor *next_;
};

/// The last link of the WGL chain: calls the platform's function and returns its result.
class ORU_API WGLErrorChecker : public WGLInterceptor {
public:
    WGLErrorChecker() = default;

    BOOL wcgmCopyContext(char const *, unsigned int, HGLRC, HGLRC, UINT) override;
    HGLRC wcgmCreateContext(char const *, unsigned int, HDC) override;
    HGLRC wcgmCreateLayerContext(char const *, unsigned int, HDC, int) override;
    BOOL wcgmDeleteContext(char const *, unsigned int, HGLRC) override;
    HGLRC wcgmGetCurrentContext(char const *, unsigned int) override;
    HDC wcgmGetCurrentDC(char const *, unsigned int) override;
    PROC wcgmGetProcAddress(char const *, unsigned int, char const *) override;
    BOOL wcgmMakeCurrent(char const *, unsigned int, HDC, HGLRC) override;
    BOOL wcgmShareLists(char const *, unsigned int, HGLRC, HGLRC) override;
    BOOL wcgmUseFontBitmapsA(char const *, unsigned int, HDC, DWORD, DWORD, DWORD) override;
    BOOL wcgmUseFontBitmapsW(char const *, unsigned int, HDC, DWORD, DWORD, DWORD) override;
    BOOL wcgmSwapBuffers(char const *, unsigned int, HDC) override;
    int wcgmSetLayerPaletteEntries(char const *, unsigned int, HDC, int, int, int,
                                   COLORREF const *) override;
    int wcgmGetLayerPaletteEntries(char const *, unsigned int, HDC, int, int, int,
                                   COLORREF *) override;
    BOOL wcgmRealizeLayerPalette(char const *, unsigned int, HDC, int, BOOL) override;
    BOOL wcgmSwapLayerBuffers(char const *, unsigned int, HDC, UINT) override;

    virtual ~WGLErrorChecker();

    // Reachable only on the checker itself, not through the chain.
    virtual BOOL wcgmUseFontOutlinesA(char const *file, unsigned int line, HDC dc, DWORD first,
                                      DWORD count, DWORD listBase, FLOAT deviation, FLOAT extrusion,
                                      int format, _GLYPHMETRICSFLOAT *metrics);
    virtual BOOL wcgmUseFontOutlinesW(char const *file, unsigned int line, HDC dc, DWORD first,
                                      DWORD count, DWORD listBase, FLOAT deviation, FLOAT extrusion,
                                      int format, _GLYPHMETRICSFLOAT *metrics);
    virtual BOOL wcgmDescribeLayerPlane(char const *file, unsigned int line, HDC dc,
                                        int pixelFormat, int layer, UINT bytes,
                                        tagLAYERPLANEDESCRIPTOR *descriptor);
    virtual DWORD wcgmSwapMultipleBuffers(char const *file, unsigned int line, UINT count,
                                          _WGLSWAP const *swaps);
};

} // namespace ORU::OGL
