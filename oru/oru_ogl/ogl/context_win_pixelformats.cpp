// Rendering contexts on Windows: choosing a pixel format, and making a context on it.
#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/functioncast.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/ogl/context.h"
#include "oru/oru_ogl/ogl/internal/contexts/temporarycontext_win.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"
#include "oru/oru_ogl/platformgl.h"

#include <vector>

namespace ORU::OGL {

using internal::TemporaryContext;

namespace {

void RequireDeviceContext(HDC dc) {
    if (!dc) // the check's text is what hosts see, with its one colon
        ORU_THROW_INTERNAL("Context:choosePixelFormat invalid device context");
}

/// The attributes of a pixel format for wglChoosePixelFormatARB, with the zero that ends them.
std::vector<int> Attributes(BufferFormat const &format, bool doubleBuffered, int samples,
                            bool toWindow) {
    auto const red = static_cast<int>(format.redBits());
    auto const green = static_cast<int>(format.greenBits());
    auto const blue = static_cast<int>(format.blueBits());
    auto const alpha = static_cast<int>(format.alphaBits());
    int const pixelType = format.floatingPointColor() ? WGL_TYPE_RGBA_FLOAT_ARB : WGL_TYPE_RGBA_ARB;
    // clang-format off
    std::vector<int> attributes = {
        WGL_SUPPORT_OPENGL_ARB, 1,
        WGL_ACCELERATION_ARB, WGL_FULL_ACCELERATION_ARB,
        WGL_PIXEL_TYPE_ARB, pixelType,
        WGL_COLOR_BITS_ARB, red + green + blue + alpha,
        WGL_RED_BITS_ARB, red,
        WGL_GREEN_BITS_ARB, green,
        WGL_BLUE_BITS_ARB, blue,
        WGL_ALPHA_BITS_ARB, alpha,
        WGL_DEPTH_BITS_ARB, static_cast<int>(format.depthBits()),
        WGL_STENCIL_BITS_ARB, static_cast<int>(format.stencilBits()),
        WGL_DOUBLE_BUFFER_ARB, doubleBuffered ? 1 : 0,
    };
    // clang-format on
    if (toWindow)
        attributes.insert(attributes.end(), {WGL_DRAW_TO_WINDOW_ARB, 1});
    else
        attributes.insert(attributes.end(),
                          {WGL_DRAW_TO_PBUFFER_ARB, 1, WGL_DRAW_TO_WINDOW_ARB, 0});
    if (samples > 1)
        attributes.insert(attributes.end(), {WGL_SAMPLE_BUFFERS_ARB, 1, WGL_SAMPLES_ARB, samples});
    attributes.push_back(0);
    return attributes;
}

} // namespace

void Context::initialize(HDC dc, BufferFormat const &format, Buffering buffering,
                         Multisampling multisampling, Context const *share) {
    ScopedContextWrapper const restoreCurrent;
    deviceContext_ = dc;
    if (!dc) // whatever the kind of the context: the check's text is what hosts see
        ORU_THROW_INTERNAL("ContextWindowed::ctor invalid DC on window");

    bool const gdiSuffices = !format.floatingPointColor() && multisampling == MULTISAMPLING_NONE &&
                             format.redBits() <= 8 && format.greenBits() <= 8 &&
                             format.blueBits() <= 8 && format.alphaBits() <= 8;
    ContextAttributes const attributes = attributesFor(format);
    TemporaryContext temporary;
    try {
        if (gdiSuffices) {
            renderContext_ =
                setupRenderingContext(dc, format, buffering == BUFFERING_DOUBLE, share);
        } else {
            HDC queryDC = ORU_WGL0(GetCurrentContext) ? ORU_WGL0(GetCurrentDC) : nullptr;
            if (!queryDC) {
                queryDC = temporary.makeWindow();
                setPixelFormat(queryDC, ChoosePixelFormat(
                                            queryDC, BufferFormat(8, 8, 8, 0, 0, 0, false), false));
                temporary.adopt(createRenderingContext(queryDC, nullptr, ContextAttributes()));
            }
            int const pixelFormat =
                ChoosePixelFormat(queryDC, format, buffering, multisampling, WINDOWING_WINDOW);
            temporary.release();
            setPixelFormat(dc, pixelFormat);
            renderContext_ = createRenderingContext(dc, share, attributes);
        }
        makeCurrent();
        if (!attributes.isDefault())
            requireAttributes(attributes);
    } catch (LogicalException const &failure) {
        if (ORU_WGL0(GetCurrentContext) || ORU_WGL0(GetCurrentDC))
            if (!ORU_WGL(MakeCurrent, nullptr, nullptr))
                ORU_THROW_INTERNAL("ContextWindowed::ContextWindowed failed to release context: "
                                   "fatal exception!");
        bool const isDeleted = temporary.destroy();
        HGLRC const made = renderContext_;
        renderContext_ = nullptr;
        if (!isDeleted || (made && !ORU_WGL(DeleteContext, made)))
            ORU_THROW_INTERNAL("ContextWindowed::ContextWindowed failed to destroy context: "
                               "fatal exception!");
        throw LogicalException(failure);
    } catch (...) {
        // Not a failure of the layer, memory running out say: it passes as it is.
        if (renderContext_)
            ORU_WGL(DeleteContext, renderContext_);
        renderContext_ = nullptr;
        throw;
    }
}

HGLRC Context::setupRenderingContext(HDC dc, BufferFormat const &format, bool doubleBuffered,
                                     Context const *share) {
    pixelFormat_ = ChoosePixelFormat(dc, format, doubleBuffered);
    setPixelFormat(dc, pixelFormat_);
    return createRenderingContext(dc, share, attributesFor(format));
}

int Context::ChoosePixelFormat(HDC dc, BufferFormat const &format, bool doubleBuffered) {
    RequireDeviceContext(dc);
    unsigned int const colorBits =
        format.redBits() + format.greenBits() + format.blueBits() + format.alphaBits();
    PIXELFORMATDESCRIPTOR descriptor = {};
    descriptor.nSize = sizeof descriptor;
    descriptor.nVersion = 1;
    descriptor.dwFlags = PFD_DRAW_TO_WINDOW | PFD_SUPPORT_OPENGL;
    if (doubleBuffered)
        descriptor.dwFlags |= PFD_DOUBLEBUFFER;
    descriptor.iPixelType = PFD_TYPE_RGBA;
    descriptor.cColorBits = static_cast<BYTE>(colorBits);
    descriptor.cAlphaBits = static_cast<BYTE>(format.alphaBits());
    descriptor.cDepthBits = static_cast<BYTE>(format.depthBits());
    descriptor.cStencilBits = static_cast<BYTE>(format.stencilBits());

    int const pixelFormat = ::ChoosePixelFormat(dc, &descriptor);
    if (!pixelFormat)
        ORU_THROW_INTERNAL("Cannot create OpenGL Context. Can't find suitable format. "
                           "Windows error ",
                           ::GetLastError());
    return pixelFormat;
}

int Context::ChoosePixelFormat(HDC dc, BufferFormat const &format, Buffering buffering,
                               Multisampling multisampling, Windowing windowing) {
    auto const choose = internal::FunctionCast<PFNWGLCHOOSEPIXELFORMATARBPROC>(
        ORU_WGL(GetProcAddress, "wglChoosePixelFormatARB"));
    if (!choose)
        ORU_THROW_INTERNAL("wglChoosePixelFormatARB extension not supported");
    RequireDeviceContext(dc);

    bool const doubleBuffered = buffering == BUFFERING_DOUBLE;
    if (multisampling > 1 && !doubleBuffered)
        ORU_THROW_INTERNAL("Double buffering required with multisampling.");
    auto const attributes =
        Attributes(format, doubleBuffered, multisampling, windowing != WINDOWING_PBUFFER);

    constexpr FLOAT kNoFloats[] = {0, 0};
    int pixelFormat = 0;
    UINT count = 0;
    if (!choose(dc, attributes.data(), kNoFloats, 1, &pixelFormat, &count) || !count)
        ORU_THROW_INTERNAL("Can't find suitable pixel format.");
    return pixelFormat;
}

void Context::setPixelFormat(HDC dc, int pixelFormat) {
    if (pixelFormat < 1)
        ORU_THROW_INTERNAL("Context::setPixelFormat invalid pixel format ", pixelFormat);
    pixelFormat_ = pixelFormat;
    PIXELFORMATDESCRIPTOR descriptor = {};
    descriptor.nSize = sizeof descriptor;
    if (!::SetPixelFormat(dc, pixelFormat, &descriptor))
        ORU_THROW_INTERNAL("Context::setPixelFormat Unable to set pixel format ", pixelFormat,
                           " on device context. Window Error: ", ::GetLastError());
}

ContextAttributes Context::attributesFor(BufferFormat const &format) const {
    ContextAttributes const attributes = format.contextAttributes();
    return attributes.isDefault() ? initOptions_.contextAttributes() : attributes;
}

HGLRC Context::createRenderingContext(HDC dc, Context const *share) {
    return createRenderingContext(dc, share, initOptions_.contextAttributes());
}

HGLRC Context::createRenderingContext(HDC dc, Context const *share,
                                      ContextAttributes const &attributes) {
    if (!dc)
        ORU_THROW_INTERNAL("Context::createRenderingContext invalid device context");

    auto const shareWith = [share](HGLRC context) {
        if (!share || ORU_WGL(ShareLists, share->renderContext(), context))
            return;
        if (context)
            ORU_WGL(DeleteContext, context);
        ORU_THROW_INTERNAL("Context::createRenderingContext cannot share lists.");
    };

    if (!attributes.isDefault()) {
        HGLRC const context = makeAsAsked(dc, attributes);
        shareWith(context);
        return context;
    }
    ExtensionManager const *const manager = ExtensionManager::Instance(displayDeviceKey_);
    if (auto const create = manager ? manager->getWglCreateContextAttribsPtr() : nullptr) {
        constexpr int kAttributes[] = {WGL_CONTEXT_MAJOR_VERSION_ARB, 3,
                                       WGL_CONTEXT_MINOR_VERSION_ARB, 0, 0};
        if (HGLRC const context = create(dc, nullptr, kAttributes)) {
            shareWith(context);
            return context;
        }
    }
    HGLRC const context = ORU_WGL(CreateContext, dc);
    shareWith(context);
    if (!context)
        ORU_THROW_INTERNAL("Context::createRenderingContext Can't create rendering context");
    return context;
}

void Context::shareLists(HGLRC other) {
    if (!ORU_WGL(ShareLists, other, renderContext_))
        ORU_THROW_INTERNAL("Context::shareLists cannot share lists.");
}

} // namespace ORU::OGL
