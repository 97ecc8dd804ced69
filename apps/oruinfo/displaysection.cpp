// Display adapters and their outputs, by DXGI.
#include "apps/common/unicode.h"
#include "apps/oruinfo/report.h"
#include "apps/oruinfo/sections.h"

#include "oru/core/exceptions/checks.h"

#include <dxgi.h>
#include <wrl/client.h>

namespace OruInfo {

namespace {

using Microsoft::WRL::ComPtr;

Value Bytes(SIZE_T bytes) {
    return {std::uint64_t{bytes}, "bytes"};
}

/// The version of the adapter's Direct3D driver, which comes with that of OpenGL.
Value DriverVersion(IDXGIAdapter &adapter) {
    LARGE_INTEGER version = {};
    if (FAILED(adapter.CheckInterfaceSupport(__uuidof(IDXGIDevice), &version)))
        return Unavailable{};
    std::string text;
    for (int shift = 48; shift >= 0; shift -= 16)
        text += (text.empty() ? "" : ".") + std::to_string(version.QuadPart >> shift & 0xFFFF);
    return text;
}

void AddAdapter(UINT index, IDXGIAdapter &adapter, Table &adapters) {
    DXGI_ADAPTER_DESC description;
    ORU_ASSERT_SUCCEEDED(adapter.GetDesc(&description));
    adapters.rows.push_back({std::uint64_t{index}, App::ToUtf8(description.Description),
                             std::uint64_t{description.VendorId},
                             std::uint64_t{description.DeviceId}, DriverVersion(adapter),
                             Bytes(description.DedicatedVideoMemory),
                             Bytes(description.SharedSystemMemory)});
}

void AddOutput(UINT adapter, IDXGIOutput &output, Table &outputs) {
    DXGI_OUTPUT_DESC description;
    ORU_ASSERT_SUCCEEDED(output.GetDesc(&description));
    RECT const &area = description.DesktopCoordinates;
    outputs.rows.push_back({App::ToUtf8(description.DeviceName), std::uint64_t{adapter},
                            description.AttachedToDesktop != FALSE, area.left == 0 && area.top == 0,
                            std::int64_t{area.left}, std::int64_t{area.top},
                            Value(std::int64_t{area.right} - area.left, "pixels"),
                            Value(std::int64_t{area.bottom} - area.top, "pixels")});
}

} // namespace

void GatherDisplays(Drivers &, Group &section) {
    Table adapters{{{"index", "#"},
                    {"name", "Name"},
                    {"vendor_id", "Vendor id"},
                    {"device_id", "Device id"},
                    {"driver_version", "Driver"},
                    {"video_memory", "Video memory"},
                    {"shared_memory", "Shared memory"}},
                   {}};
    Table outputs{{{"name", "Name"},
                   {"adapter", "Adapter"},
                   {"is_attached", "On the desktop"},
                   {"is_primary", "Primary"},
                   {"left", "Left"},
                   {"top", "Top"},
                   {"width", "Width"},
                   {"height", "Height"}},
                  {}};
    ComPtr<IDXGIFactory1> factory;
    ORU_ASSERT_SUCCEEDED(CreateDXGIFactory1(IID_PPV_ARGS(factory.ReleaseAndGetAddressOf())));
    ComPtr<IDXGIAdapter> adapter;
    for (UINT i = 0; SUCCEEDED(factory->EnumAdapters(i, adapter.ReleaseAndGetAddressOf())); ++i) {
        AddAdapter(i, *adapter.Get(), adapters);
        ComPtr<IDXGIOutput> output;
        for (UINT j = 0; SUCCEEDED(adapter->EnumOutputs(j, output.ReleaseAndGetAddressOf())); ++j)
            AddOutput(i, *output.Get(), outputs);
    }
    section.add("adapters", "Adapters", adapters);
    section.add("outputs", "Outputs", outputs);
}

} // namespace OruInfo
