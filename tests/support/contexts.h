// What the context tests share: contexts of the host, windowed and opened ones, and their count.
#pragma once

#include "tests/support/objecttest.h"
#include "tests/support/testwindow.h"

#include "oru/oru_ogl/extensionator/internal/functioncast.h"
#include "oru/oru_ogl/extensionator/wgl/wglforwarder.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"
#include "oru/oru_ogl/ogl/contextwrapped_win.h"

#include <algorithm>

namespace oru_test {

using namespace ORU::OGL;

/// A context whose protected members a test may call.
template<class Kind>
class Exposed : public Kind {
public:
    template<class... Arguments>
    explicit Exposed(Arguments const &...arguments) : Kind(arguments...) {}

    using Kind::addShareContext;
    using Kind::ChoosePixelFormat;
    using Kind::createRenderingContext;
    using Kind::DisplayDeviceFromWindow;
    using Kind::DisplayOrigin;
    using Kind::initialize;
    using Kind::PrimaryDisplayDevice;
    using Kind::setDisplayDeviceKey;
    using Kind::setPixelFormat;
    using Kind::shareLists;
    using Kind::UnregisterShareContext;
};

inline ContextWindowed Windowed(TestWindow const &window, Context const *share = nullptr,
                                BufferFormat const &format = BufferFormat::FORMAT_RGBA8_D24,
                                int samples = 1,
                                Context::Buffering buffering = Context::BUFFERING_DOUBLE) {
    return ContextWindowed(window.hwnd(), format, buffering,
                           static_cast<Context::Multisampling>(samples), share);
}

/// A rendering context that the host makes with plain calls, current for its lifetime.
class HostContext {
public:
    /// @param attributes for wglCreateContextAttribsARB
    explicit HostContext(HGLRC share = nullptr, std::vector<int> const &attributes = {0}) {
        PIXELFORMATDESCRIPTOR descriptor = {};
        descriptor.nSize = sizeof descriptor;
        descriptor.dwFlags = PFD_DRAW_TO_WINDOW | PFD_SUPPORT_OPENGL;
        ::SetPixelFormat(dc_, ::ChoosePixelFormat(dc_, &descriptor), &descriptor);
        HGLRC const first = ::wglCreateContext(dc_);
        EXPECT_TRUE(::wglMakeCurrent(dc_, first));
        auto const create = internal::FunctionCast<PFNWGLCREATECONTEXTATTRIBSARBPROC>(
            ::wglGetProcAddress("wglCreateContextAttribsARB"));
        rc_ = create(dc_, share, attributes.data());
        makeCurrent();
        ::wglDeleteContext(first);
    }
    ~HostContext() {
        ::wglMakeCurrent(nullptr, nullptr);
        ::wglDeleteContext(rc_);
        ::ReleaseDC(window_.hwnd(), dc_);
    }
    HostContext(HostContext const &) = delete;
    HostContext &operator=(HostContext const &) = delete;

    void makeCurrent() const { EXPECT_TRUE(::wglMakeCurrent(dc_, rc_)); }

    HDC dc() const { return dc_; }
    HGLRC rc() const { return rc_; }

private:
    TestWindow window_{0};
    HDC dc_ = ::GetDC(window_.hwnd());
    HGLRC rc_ = nullptr;
};

/// Follows the contexts that the library makes, by either function, and deletes: one at a time, on
/// one thread, and pushed before the library first makes a context.
class ContextCounter : public WGLForwarder {
public:
    /// @param isDeaf whether contexts with attributes are made of OpenGL 3.0, whatever is asked
    explicit ContextCounter(bool isDeaf = false) {
        sIsDeaf_ = isDeaf;
        sMade_ = 0;
        sAlive_.clear();
        sGone_.clear();
    }

    HGLRC wcgmCreateContext(char const *file, unsigned int line, HDC dc) override {
        return Counted(WGLForwarder::wcgmCreateContext(file, line, dc));
    }
    BOOL wcgmDeleteContext(char const *file, unsigned int line, HGLRC rc) override {
        sGone_.insert(sAlive_.extract(rc));
        return WGLForwarder::wcgmDeleteContext(file, line, rc);
    }
    PROC wcgmGetProcAddress(char const *file, unsigned int line, char const *name) override {
        PROC const real = WGLForwarder::wcgmGetProcAddress(file, line, name);
        if (!real || std::string(name) != "wglCreateContextAttribsARB")
            return real;
        sCreate_ = internal::FunctionCast<PFNWGLCREATECONTEXTATTRIBSARBPROC>(real);
        return reinterpret_cast<PROC>(reinterpret_cast<void *>(&CreateContextAttribs));
    }

    static int Made() { return sMade_; }
    static std::size_t Alive() { return sAlive_.size(); }
    /// Contexts that are gone and have a record all the same.
    static auto Remembered() {
        return std::count_if(sGone_.begin(), sGone_.end(),
                             [](HGLRC rc) { return ExtensionManager::Instance(rc) != nullptr; });
    }

private:
    static HGLRC Counted(HGLRC made) {
        sMade_ += made ? 1 : 0;
        if (made)
            sAlive_.insert(made);
        sGone_.erase(made); // a handle may be used again
        return made;
    }
    static HGLRC WINAPI CreateContextAttribs(HDC dc, HGLRC share, int const *attributes) {
        int const old[] = {WGL_CONTEXT_MAJOR_VERSION_ARB, 3, 0};
        return Counted(sCreate_(dc, share, sIsDeaf_ ? old : attributes));
    }

    static inline bool sIsDeaf_ = false;
    static inline int sMade_ = 0;
    static inline std::set<HGLRC> sAlive_, sGone_;
    static inline PFNWGLCREATECONTEXTATTRIBSARBPROC sCreate_ = nullptr;
};

} // namespace oru_test
