// Rendering contexts on Windows: display devices, pixel formats, creation and destruction.
#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ogl/extensionator/internal/functioncast.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/internalwindow.h"
#include "oru/oru_ogl/ogl/context.h"
#include "oru/oru_ogl/ogl/internal/contexts/temporarycontext_win.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"
#include "oru/oru_ogl/platformgl.h"

#include <boost/format.hpp>
#include <d3d11.h>
#include <dxgi.h>
#include <wrl/client.h>

#include <climits>
#include <vector>

namespace ORU::OGL {

using internal::TemporaryContext;
using Microsoft::WRL::ComPtr;

// Display devices ---------------------------------------------------------------------------------

namespace {

/// The UTF-8 form of a zero-terminated wide text.
std::string ToUTF8(wchar_t const *text) {
    int const size = ::WideCharToMultiByte(CP_UTF8, 0, text, -1, nullptr, 0, nullptr, nullptr);
    if (size <= 1)
        return std::string();
    std::string result(static_cast<std::size_t>(size), '\0');
    ::WideCharToMultiByte(CP_UTF8, 0, text, -1, &result[0], size, nullptr, nullptr);
    result.pop_back(); // the terminating zero
    return result;
}

ComPtr<IDXGIFactory1> CreateFactory() {
    ComPtr<IDXGIFactory1> dxgiFactory;
    ORU_ASSERT_SUCCEEDED(CreateDXGIFactory1(IID_PPV_ARGS(dxgiFactory.ReleaseAndGetAddressOf())));
    return dxgiFactory;
}

DXGI_ADAPTER_DESC Describe(ComPtr<IDXGIAdapter> const &adapter) {
    DXGI_ADAPTER_DESC adapterDescription;
    ORU_ASSERT_SUCCEEDED(adapter->GetDesc(&adapterDescription));
    return adapterDescription;
}

DXGI_OUTPUT_DESC Describe(ComPtr<IDXGIOutput> const &display) {
    DXGI_OUTPUT_DESC displayDescription;
    ORU_ASSERT_SUCCEEDED(display->GetDesc(&displayDescription));
    return displayDescription;
}

bool IsAttached(DXGI_OUTPUT_DESC const &display) {
    return display.AttachedToDesktop != FALSE;
}

/// Visits the adapters in the system's order until a visit returns true.
template<class Visit>
bool VisitAdapters(Visit visit) {
    ComPtr<IDXGIFactory1> const factory = CreateFactory();
    ComPtr<IDXGIAdapter> adapter;
    for (UINT i = 0; SUCCEEDED(factory->EnumAdapters(i, adapter.ReleaseAndGetAddressOf())); ++i)
        if (visit(adapter))
            return true;
    return false;
}

/// The first output of an adapter that is wanted.
template<class Wanted>
bool FindOutput(ComPtr<IDXGIAdapter> const &adapter, Wanted wanted, DXGI_OUTPUT_DESC &output) {
    ComPtr<IDXGIOutput> display;
    for (UINT j = 0; SUCCEEDED(adapter->EnumOutputs(j, display.ReleaseAndGetAddressOf())); ++j) {
        output = Describe(display);
        if (wanted(output))
            return true;
    }
    return false;
}

DisplayDeviceKey MakeKey(ComPtr<IDXGIAdapter> const &adapter, DXGI_OUTPUT_DESC const &output) {
    DXGI_ADAPTER_DESC const description = Describe(adapter);
    return DisplayDeviceKey(ToUTF8(output.DeviceName), ToUTF8(description.Description),
                            (boost::format("%1%") % description.DeviceId).str());
}

/// The key of the first wanted output of any adapter.
template<class Wanted>
bool FindKey(Wanted wanted, DisplayDeviceKey &key) {
    return VisitAdapters([&](ComPtr<IDXGIAdapter> const &adapter) {
        DXGI_OUTPUT_DESC output;
        if (!FindOutput(adapter, wanted, output))
            return false;
        key = MakeKey(adapter, output);
        return true;
    });
}

DisplayDeviceKey AdapterDisplayKey(UINT adapterIndex) {
    ComPtr<IDXGIFactory1> const dxgiFactory = CreateFactory();
    ComPtr<IDXGIAdapter> adapter;
    ORU_ASSERT_SUCCEEDED(dxgiFactory->EnumAdapters(adapterIndex, adapter.ReleaseAndGetAddressOf()));
    DXGI_OUTPUT_DESC output;
    if (!FindOutput(adapter, IsAttached, output))
        ORU_THROW_INTERNAL("Wasn't able to find the specified card attached to the desktop");
    return MakeKey(adapter, output);
}

/// The name of the output that shows a window; the system answers only through a swap chain.
std::string WindowOutputName(HWND theWindow) {
    RECT windowRect;
    ORU_ASSERT(GetWindowRect(theWindow, &windowRect));

    DXGI_SWAP_CHAIN_DESC swapChainDesc = {};
    swapChainDesc.BufferDesc.Width = static_cast<UINT>(windowRect.right - windowRect.left + 1);
    swapChainDesc.BufferDesc.Height = static_cast<UINT>(windowRect.bottom - windowRect.top + 1);
    swapChainDesc.BufferDesc.Format = DXGI_FORMAT_R8G8B8A8_UNORM;
    swapChainDesc.SampleDesc.Count = 1;
    swapChainDesc.BufferUsage = DXGI_USAGE_RENDER_TARGET_OUTPUT;
    swapChainDesc.BufferCount = 2;
    swapChainDesc.OutputWindow = theWindow;
    swapChainDesc.Windowed = TRUE;
    swapChainDesc.SwapEffect = DXGI_SWAP_EFFECT_DISCARD;

    ComPtr<IDXGISwapChain> swapChain;
    ComPtr<ID3D11Device> d3dDevice;
    // The call's own text is the message, where a line break after a parenthesis would be a blank.
    // clang-format off
    ORU_ASSERT_SUCCEEDED(D3D11CreateDeviceAndSwapChain(nullptr, D3D_DRIVER_TYPE_HARDWARE, nullptr,
        0x0, nullptr, 0, D3D11_SDK_VERSION, &swapChainDesc, swapChain.ReleaseAndGetAddressOf(),
        d3dDevice.ReleaseAndGetAddressOf(), nullptr, nullptr));
    // clang-format on
    ComPtr<IDXGIOutput> primaryOutput;
    ORU_ASSERT_SUCCEEDED(swapChain->GetContainingOutput(&primaryOutput));
    DXGI_OUTPUT_DESC outputDesc;
    ORU_ASSERT_SUCCEEDED(primaryOutput->GetDesc(&outputDesc));
    return ToUTF8(outputDesc.DeviceName);
}

} // namespace

std::size_t Context::NumDisplayDevice() {
    try {
        std::size_t count = 0;
        VisitAdapters([&count](ComPtr<IDXGIAdapter> const &adapter) {
            DXGI_OUTPUT_DESC output;
            if (FindOutput(adapter, IsAttached, output))
                ++count;
            return false;
        });
        return count;
    } catch (...) {
        return 0; // a host that counts displays asks whether there is one to use
    }
}

bool Context::DisplayDevice(std::size_t index, DisplayDeviceKey &key) {
    try {
        // An index beyond what the system can count must not wrap to one that exists.
        if (index > UINT_MAX)
            return false;
        key = AdapterDisplayKey(static_cast<UINT>(index));
        return true;
    } catch (...) {
        return false;
    }
}

DisplayDeviceKey Context::DisplayDeviceFromWindow(HWND const &window) {
    std::string const name = WindowOutputName(window);
    DisplayDeviceKey key;
    auto const hasName = [&name](DXGI_OUTPUT_DESC const &o) {
        return ToUTF8(o.DeviceName) == name;
    };
    if (!FindKey(hasName, key))
        ORU_THROW_INTERNAL("Unable to determine device for specified window");
    return key;
}

DisplayDeviceKey const &Context::PrimaryDisplayDevice() {
    static DisplayDeviceKey primary;
    static bool isKnown = false;
    if (!isKnown) {
        DisplayDeviceKey key;
        auto const isAtOrigin = [](DXGI_OUTPUT_DESC const &output) {
            return output.DesktopCoordinates.left == 0 && output.DesktopCoordinates.top == 0;
        };
        if (!FindKey(isAtOrigin, key))
            ORU_THROW_INTERNAL("Unable to determine primary display");
        primary = key;
        isKnown = true;
    }
    return primary;
}

ambra::lumo::TVec2<int> Context::DisplayOrigin(std::string const &adapterName,
                                               bool defaultToZeroOnFailure) {
    ambra::lumo::TVec2<int> origin(0, 0);
    bool found = false;
    try {
        found = VisitAdapters([&](ComPtr<IDXGIAdapter> const &adapter) {
            DXGI_OUTPUT_DESC output;
            if (ToUTF8(Describe(adapter).Description) != adapterName ||
                !FindOutput(adapter, IsAttached, output))
                return false;
            origin = ambra::lumo::TVec2<int>(static_cast<int>(output.DesktopCoordinates.left),
                                             static_cast<int>(output.DesktopCoordinates.top));
            return true;
        });
    } catch (...) {
        ORU_ASSERT(defaultToZeroOnFailure);
        return origin;
    }
    if (!found)
        ORU_THROW_INTERNAL("Adapter not found");
    return origin;
}

// The context itself ------------------------------------------------------------------------------

void Context::makeCurrent() const {
    if (!ORU_WGL(MakeCurrent, deviceContext_, renderContext_))
        ORU_THROW_INTERNAL(
            ComposeText("Context::can't make this context current", ::GetLastError()));
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

// Pixel formats and creation ----------------------------------------------------------------------

void Context::initialize(HDC dc, BufferFormat const &format, Buffering buffering,
                         Multisampling multisampling, Context const *share) {
    ScopedContextWrapper const restoreCurrent;
    deviceContext_ = dc;
    if (!dc)
        ORU_THROW_INTERNAL("ContextWindowed::ctor invalid DC on window");

    bool const gdiSuffices = !format.floatingPointColor() && multisampling == MULTISAMPLING_NONE &&
                             format.redBits() <= 8 && format.greenBits() <= 8 &&
                             format.blueBits() <= 8 && format.alphaBits() <= 8;
    TemporaryContext temporary;
    try {
        if (gdiSuffices) {
            renderContext_ =
                setupRenderingContext(dc, format, buffering == BUFFERING_DOUBLE, share);
        } else {
            HDC queryDC = ORU_WGL0(GetCurrentContext) ? ORU_WGL0(GetCurrentDC) : nullptr;
            if (!queryDC) {
                queryDC = temporary.makeWindow();
                temporary.adopt(setupRenderingContext(
                    queryDC, BufferFormat(8, 8, 8, 0, 0, 0, false), false, nullptr));
            }
            int const pixelFormat =
                ChoosePixelFormat(queryDC, format, buffering, multisampling, WINDOWING_WINDOW);
            temporary.release();
            setPixelFormat(dc, pixelFormat);
            renderContext_ = createRenderingContext(dc, share);
        }
        makeCurrent();
    } catch (LogicalException const &failure) {
        if (ORU_WGL0(GetCurrentContext) || ORU_WGL0(GetCurrentDC))
            if (!ORU_WGL(MakeCurrent, nullptr, nullptr))
                ORU_THROW_INTERNAL("ContextWindowed::ContextWindowed failed to release context: "
                                   "fatal exception!");
        bool const isDeleted = temporary.release();
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
    return createRenderingContext(dc, share);
}

int Context::ChoosePixelFormat(HDC dc, BufferFormat const &format, bool doubleBuffered) {
    if (!dc)
        ORU_THROW_INTERNAL("Context:choosePixelFormat invalid device context");
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
        ORU_THROW_INTERNAL(ComposeText("Cannot create OpenGL Context. Can't find suitable format. "
                                       "Windows error ",
                                       ::GetLastError()));
    return pixelFormat;
}

int Context::ChoosePixelFormat(HDC dc, BufferFormat const &format, Buffering buffering,
                               Multisampling multisampling, Windowing windowing) {
    auto const choose = internal::FunctionCast<PFNWGLCHOOSEPIXELFORMATARBPROC>(
        ORU_WGL(GetProcAddress, "wglChoosePixelFormatARB"));
    if (!choose)
        ORU_THROW_INTERNAL("wglChoosePixelFormatARB extension not supported");
    if (!dc)
        ORU_THROW_INTERNAL("Context:choosePixelFormat invalid device context");

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
        WGL_DOUBLE_BUFFER_ARB, buffering == BUFFERING_DOUBLE ? 1 : 0,
    };
    // clang-format on
    if (windowing == WINDOWING_PBUFFER)
        attributes.insert(attributes.end(),
                          {WGL_DRAW_TO_PBUFFER_ARB, 1, WGL_DRAW_TO_WINDOW_ARB, 0});
    else
        attributes.insert(attributes.end(), {WGL_DRAW_TO_WINDOW_ARB, 1});
    if (multisampling > 1) {
        if (buffering != BUFFERING_DOUBLE)
            ORU_THROW_INTERNAL("Double buffering required with multisampling.");
        attributes.insert(attributes.end(),
                          {WGL_SAMPLE_BUFFERS_ARB, 1, WGL_SAMPLES_ARB, multisampling});
    }
    attributes.push_back(0);

    FLOAT const noFloats[] = {0, 0};
    int pixelFormat = 0;
    UINT count = 0;
    if (!choose(dc, attributes.data(), noFloats, 1, &pixelFormat, &count) || !count)
        ORU_THROW_INTERNAL("Can't find suitable pixel format.");
    return pixelFormat;
}

void Context::setPixelFormat(HDC dc, int pixelFormat) {
    if (pixelFormat < 1)
        ORU_THROW_INTERNAL(
            ComposeText("Context::setPixelFormat invalid pixel format ", pixelFormat));
    pixelFormat_ = pixelFormat;
    PIXELFORMATDESCRIPTOR descriptor = {};
    descriptor.nSize = sizeof descriptor;
    if (!::SetPixelFormat(dc, pixelFormat, &descriptor))
        ORU_THROW_INTERNAL(ComposeText("Context::setPixelFormat Unable to set pixel format ",
                                       pixelFormat,
                                       " on device context. Window Error: ", ::GetLastError()));
}

HGLRC Context::createRenderingContext(HDC dc, Context const *share) {
    if (!dc)
        ORU_THROW_INTERNAL("Context::createRenderingContext invalid device context");

    auto const shareWith = [share](HGLRC context) {
        if (!share || ORU_WGL(ShareLists, share->renderContext(), context))
            return;
        if (context)
            ORU_WGL(DeleteContext, context);
        ORU_THROW_INTERNAL("Context::createRenderingContext cannot share lists.");
    };

    ExtensionManager const *const manager = ExtensionManager::Instance(displayDeviceKey_);
    if (auto const create = manager ? manager->getWglCreateContextAttribsPtr() : nullptr) {
        int const attributes[] = {WGL_CONTEXT_MAJOR_VERSION_ARB, 3, WGL_CONTEXT_MINOR_VERSION_ARB,
                                  0, 0};
        if (HGLRC const context = create(dc, nullptr, attributes)) {
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

void Context::destroyContext() {
    HDC const currentDC = ORU_WGL0(GetCurrentDC);
    HGLRC const current = ORU_WGL0(GetCurrentContext);
    if (current && !ORU_WGL(MakeCurrent, nullptr, nullptr))
        ORU_THROW_INTERNAL("Context::destroyContext() failed to release context");
    if (!ORU_WGL(DeleteContext, renderContext_))
        ORU_THROW_INTERNAL("Context::destroyContext() failed to delete rendering context");
    if (current && current != renderContext_ && !ORU_WGL(MakeCurrent, currentDC, current))
        ORU_ASSERT(!"ContextOffscreen::destroyContext() failed to restore context");
}

} // namespace ORU::OGL
