// Display devices; the build also runs this where Wine has no Direct3D.
#include "tests/support/contexts.h"

#include <dxgi.h>
#include <wrl/client.h>

#include <cstdlib>

using namespace oru_test;
using Microsoft::WRL::ComPtr;

TEST(DisplayDevices, AreThoseOfTheSystem) {
    ComPtr<IDXGIFactory1> factory;
    ASSERT_EQ(S_OK, ::CreateDXGIFactory1(IID_PPV_ARGS(factory.GetAddressOf())));
    ComPtr<IDXGIAdapter> adapter;
    ASSERT_EQ(S_OK, factory->EnumAdapters(0, adapter.GetAddressOf()));
    DXGI_ADAPTER_DESC description = {};
    adapter->GetDesc(&description);
    std::wstring const name = description.Description; // ASCII, as the makers write them

    DisplayDeviceKey key;
    ASSERT_TRUE(Context::DisplayDevice(0, key));
    EXPECT_EQ(std::string(name.begin(), name.end()), key.adapterName);
    EXPECT_EQ(std::to_string(description.DeviceId), key.deviceID);
    EXPECT_EQ(0u, key.displayName.find("\\\\.\\DISPLAY")) << key.displayName;
    EXPECT_FALSE(Context::DisplayDevice(0x100000000, key));
    EXPECT_GE(Context::NumDisplayDevice(), 1u);
}

TEST(DisplayDevices, AreFoundForWindowsAndNames) {
    using Devices = Exposed<Context>;
    DisplayDeviceKey const &primary = Devices::PrimaryDisplayDevice();
    auto const origin = Devices::DisplayOrigin(primary.adapterName, false);
    EXPECT_TRUE(origin.x == 0 && origin.y == 0);
    EXPECT_FAILURE("Adapter not found", Devices::DisplayOrigin("no such adapter", true));
    EXPECT_FAILURE("GetWindowRect(theWindow, &windowRect)",
                   Devices::DisplayDeviceFromWindow(nullptr));

    TestWindow const window;
    DisplayDeviceKey shown;
    std::string const message =
        MessageOf([&] { shown = Devices::DisplayDeviceFromWindow(window.hwnd()); });
    if (!std::getenv("WINE_D3D_CONFIG")) {
        EXPECT_EQ("", message);
        EXPECT_EQ(primary.displayName, shown.displayName); // one output shows everything here
    } else if (message.empty()) {
        GTEST_SKIP() << "Direct3D cannot be switched off here";
    } else {
        EXPECT_EQ(0u, message.find("D3D11CreateDeviceAndSwapChain(")) << message;
    }
}
