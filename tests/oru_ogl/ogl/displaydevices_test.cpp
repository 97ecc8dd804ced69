// Display devices against what DXGI itself says; the build also runs this where Wine has no
// Direct3D.
#include "tests/support/testwindow.h"

#include "oru/oru_ogl/ogl/context.h"

#include <dxgi.h>
#include <gtest/gtest.h>
#include <wrl/client.h>

#include <cstdlib>

using namespace ORU::OGL;
using Microsoft::WRL::ComPtr;
using oru_test::MessageOf;

namespace {

struct Exposed : Context {
    using Context::DisplayDeviceFromWindow;
    using Context::DisplayOrigin;
    using Context::PrimaryDisplayDevice;
};

std::string Narrow(wchar_t const *text) {
    std::string result(256, '\0');
    result.resize(static_cast<std::size_t>(
        ::WideCharToMultiByte(CP_UTF8, 0, text, -1, &result[0], 256, nullptr, nullptr) - 1));
    return result;
}

} // namespace

TEST(DisplayDevices, AreThoseOfTheSystem) {
    ComPtr<IDXGIFactory1> factory;
    ASSERT_EQ(S_OK, ::CreateDXGIFactory1(IID_PPV_ARGS(factory.GetAddressOf())));
    ComPtr<IDXGIAdapter> adapter;
    UINT count = 0, withOutput = 0;
    for (; factory->EnumAdapters(count, adapter.ReleaseAndGetAddressOf()) == S_OK; ++count) {
        DXGI_ADAPTER_DESC description = {};
        adapter->GetDesc(&description);
        DXGI_OUTPUT_DESC shown = {}; // the first output on the desktop
        ComPtr<IDXGIOutput> output;
        for (UINT j = 0; !shown.AttachedToDesktop &&
                         adapter->EnumOutputs(j, output.ReleaseAndGetAddressOf()) == S_OK;
             ++j)
            output->GetDesc(&shown);
        DisplayDeviceKey key("unchanged", "", "");
        EXPECT_EQ(shown.AttachedToDesktop != FALSE, Context::DisplayDevice(count, key)) << count;
        if (!shown.AttachedToDesktop) {
            EXPECT_EQ("unchanged", key.displayName);
            continue;
        }
        ++withOutput;
        EXPECT_EQ(Narrow(shown.DeviceName), key.displayName);
        EXPECT_EQ(Narrow(description.Description), key.adapterName);
        EXPECT_EQ(std::to_string(description.DeviceId), key.deviceID);
    }
    EXPECT_EQ(withOutput, Context::NumDisplayDevice());
    ASSERT_GE(withOutput, 1u);

    DisplayDeviceKey key("unchanged", "a", "b");
    for (std::size_t beyond : {std::size_t(count), std::size_t(0x100000000), ~std::size_t(0)}) {
        EXPECT_FALSE(Context::DisplayDevice(beyond, key));
        EXPECT_EQ("unchanged", key.displayName);
    }
}

TEST(DisplayDevices, AreFoundForWindowsAndNames) {
    auto const &primary = Exposed::PrimaryDisplayDevice();
    auto const origin = Exposed::DisplayOrigin(primary.adapterName, false);
    EXPECT_EQ(0, origin.x);
    EXPECT_EQ(0, origin.y);
    for (bool toZero : {false, true})
        EXPECT_EQ("Adapter not found",
                  MessageOf([=] { Exposed::DisplayOrigin("no such adapter", toZero); }));
    EXPECT_EQ("GetWindowRect(theWindow, &windowRect)",
              MessageOf([] { Exposed::DisplayDeviceFromWindow(nullptr); }));

    oru_test::TestWindow const window;
    DisplayDeviceKey shown;
    std::string const message =
        MessageOf([&] { shown = Exposed::DisplayDeviceFromWindow(window.hwnd()); });
    if (!std::getenv("WINE_D3D_CONFIG")) {
        EXPECT_EQ("", message);
        EXPECT_EQ(primary.displayName, shown.displayName); // one output shows everything here
    } else if (message.empty()) {
        GTEST_SKIP() << "Direct3D cannot be switched off here";
    } else {
        EXPECT_EQ("D3D11CreateDeviceAndSwapChain(nullptr, D3D_DRIVER_TYPE_HARDWARE, nullptr, 0x0, "
                  "nullptr, 0, D3D11_SDK_VERSION, &swapChainDesc, "
                  "swapChain.ReleaseAndGetAddressOf(), d3dDevice.ReleaseAndGetAddressOf(), "
                  "nullptr, nullptr)",
                  message);
    }
}
