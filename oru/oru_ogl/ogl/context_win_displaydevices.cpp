// Display devices of Windows: adapters and their outputs, by DXGI.
#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/internal/functioncast.h"
#include "oru/oru_ogl/ogl/context.h"
#include "oru/oru_ogl/ogl/internal/contexts/adapterorigins_win.h"
#include "oru/oru_ogl/platformgl.h"

#include <boost/format.hpp>
#include <d3d11.h>
#include <dxgi.h>
#include <wrl/client.h>

#include <climits>

namespace ORU::OGL {

using Microsoft::WRL::ComPtr;

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

DisplayDeviceKey MakeKey(DXGI_ADAPTER_DESC const &description, DXGI_OUTPUT_DESC const &output) {
    return DisplayDeviceKey(ToUTF8(output.DeviceName), ToUTF8(description.Description),
                            (boost::format("%1%") % description.DeviceId).str());
}

DisplayDeviceKey AdapterDisplayKey(UINT adapterIndex) {
    ComPtr<IDXGIFactory1> const dxgiFactory = CreateFactory();
    ComPtr<IDXGIAdapter> adapter;
    ORU_ASSERT_SUCCEEDED(dxgiFactory->EnumAdapters(adapterIndex, adapter.ReleaseAndGetAddressOf()));
    DXGI_ADAPTER_DESC const description = Describe(adapter);
    DXGI_OUTPUT_DESC output;
    if (!FindOutput(adapter, IsAttached, output))
        ORU_THROW_INTERNAL("Wasn't able to find the specified card attached to the desktop");
    return MakeKey(description, output);
}

/// Direct3D's function, or null where the system has no Direct3D. Its library is large and brings
/// others along, so it is loaded only when a window's display is asked for; it stays then.
PFN_D3D11_CREATE_DEVICE_AND_SWAP_CHAIN LoadCreateDeviceAndSwapChain() {
    HMODULE const library = ::LoadLibraryW(L"d3d11.dll");
    if (!library)
        return nullptr;
    return internal::FunctionCast<PFN_D3D11_CREATE_DEVICE_AND_SWAP_CHAIN>(
        ::GetProcAddress(library, "D3D11CreateDeviceAndSwapChain"));
}

/// The name of the output that shows a window; the system answers only through a swap chain.
std::string WindowOutputName(HWND window) {
    RECT windowRect;
    ORU_ASSERT_TEXT("GetWindowRect(theWindow, &windowRect)", ::GetWindowRect(window, &windowRect));

    DXGI_SWAP_CHAIN_DESC swapChainDesc = {};
    swapChainDesc.BufferDesc.Width = static_cast<UINT>(windowRect.right - windowRect.left + 1);
    swapChainDesc.BufferDesc.Height = static_cast<UINT>(windowRect.bottom - windowRect.top + 1);
    swapChainDesc.BufferDesc.Format = DXGI_FORMAT_R8G8B8A8_UNORM;
    swapChainDesc.SampleDesc.Count = 1;
    swapChainDesc.BufferUsage = DXGI_USAGE_RENDER_TARGET_OUTPUT;
    swapChainDesc.BufferCount = 2;
    swapChainDesc.OutputWindow = window;
    swapChainDesc.Windowed = TRUE;
    swapChainDesc.SwapEffect = DXGI_SWAP_EFFECT_DISCARD;

    auto const create = LoadCreateDeviceAndSwapChain();
    ComPtr<IDXGISwapChain> swapChain;
    ComPtr<ID3D11Device> d3dDevice;
    ORU_ASSERT_TEXT(
        "D3D11CreateDeviceAndSwapChain(nullptr, D3D_DRIVER_TYPE_HARDWARE, nullptr, 0x0, nullptr, "
        "0, D3D11_SDK_VERSION, &swapChainDesc, swapChain.ReleaseAndGetAddressOf(), "
        "d3dDevice.ReleaseAndGetAddressOf(), nullptr, nullptr)",
        create &&
            SUCCEEDED(create(nullptr, D3D_DRIVER_TYPE_HARDWARE, nullptr, 0x0, nullptr, 0,
                             D3D11_SDK_VERSION, &swapChainDesc, swapChain.ReleaseAndGetAddressOf(),
                             d3dDevice.ReleaseAndGetAddressOf(), nullptr, nullptr)));
    ComPtr<IDXGIOutput> primaryOutput;
    ORU_ASSERT_SUCCEEDED(swapChain->GetContainingOutput(&primaryOutput));
    DXGI_OUTPUT_DESC outputDesc;
    ORU_ASSERT_SUCCEEDED(primaryOutput->GetDesc(&outputDesc));
    return ToUTF8(outputDesc.DeviceName);
}

ambra::lumo::TVec2<int> OriginOf(DXGI_OUTPUT_DESC const &output) {
    return {static_cast<int>(output.DesktopCoordinates.left),
            static_cast<int>(output.DesktopCoordinates.top)};
}

/// Remembers where an adapter's desktop begins, for the contexts that are made next.
void RememberOrigin(ComPtr<IDXGIAdapter> const &adapter) {
    DXGI_OUTPUT_DESC output;
    if (FindOutput(adapter, IsAttached, output))
        internal::AdapterOrigins::Remember(ToUTF8(Describe(adapter).Description), OriginOf(output));
}

/// The key of the first wanted output of any adapter.
template<class Wanted>
bool FindKey(Wanted wanted, DisplayDeviceKey &key) {
    return VisitAdapters([&](ComPtr<IDXGIAdapter> const &adapter) {
        DropExceptions([&] { RememberOrigin(adapter); }); // nobody asked for it
        DXGI_OUTPUT_DESC output;
        if (!FindOutput(adapter, wanted, output))
            return false;
        key = MakeKey(Describe(adapter), output);
        return true;
    });
}

/// The output at the desktop's origin, attached or not.
DisplayDeviceKey FindPrimary() {
    DisplayDeviceKey key;
    auto const isAtOrigin = [](DXGI_OUTPUT_DESC const &output) {
        return output.DesktopCoordinates.left == 0 && output.DesktopCoordinates.top == 0;
    };
    if (!FindKey(isAtOrigin, key))
        ORU_THROW_INTERNAL("Unable to determine primary display");
    return key;
}

/// The position of the adapter's first attached output, which is remembered.
ambra::lumo::TVec2<int> FindOrigin(std::string const &adapterName, bool defaultToZeroOnFailure) {
    ambra::lumo::TVec2<int> origin(0, 0);
    bool found = false;
    try {
        found = VisitAdapters([&](ComPtr<IDXGIAdapter> const &adapter) {
            DXGI_OUTPUT_DESC output;
            if (ToUTF8(Describe(adapter).Description) != adapterName ||
                !FindOutput(adapter, IsAttached, output))
                return false;
            origin = OriginOf(output);
            internal::AdapterOrigins::Remember(adapterName, origin);
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
    if (!FindKey([&](DXGI_OUTPUT_DESC const &o) { return ToUTF8(o.DeviceName) == name; }, key))
        ORU_THROW_INTERNAL("Unable to determine device for specified window");
    return key;
}

DisplayDeviceKey const &Context::PrimaryDisplayDevice() {
    static DisplayDeviceKey const kPrimary = FindPrimary(); // tried again after a failure
    return kPrimary;
}

ambra::lumo::TVec2<int> Context::DisplayOrigin(std::string const &adapterName,
                                               bool defaultToZeroOnFailure) {
    return FindOrigin(adapterName, defaultToZeroOnFailure);
}

ambra::lumo::TVec2<int> internal::AdapterOrigin(std::string const &adapterName) {
    if (auto const known = AdapterOrigins::Find(adapterName))
        return *known;
    return FindOrigin(adapterName, true);
}

} // namespace ORU::OGL
