// An OpenCL device.
#include "oru/oru_ocl/device.h"

#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ocl/internal/infoquery.h"
#include "oru/oru_ocl/internal/profiletext.h"
#include "oru/oru_ocl/platform.h"

#include <algorithm>
#include <cstdint>

namespace ORU::OCL {

void Device::getInfoImpl(Enum::DeviceProperty property, std::size_t size, void *value,
                         std::size_t *sizeReturned) const {
    ORU_ASSERT(id() != 0);
    ORU_CL(GetDeviceInfo, id(), cl_device_info(property), size, value, sizeReturned);
}

std::string Device::getStringInfo(Enum::DeviceProperty property) const {
    ORU_ASSERT_NOTED("GetPropertyTypeName(property) == Enum::GetTypeName<char*>()",
                     Enum::DescribeTypes(property, Enum::GetTypeName<char *>()),
                     Enum::GetPropertyTypeName(property) == Enum::GetTypeName<char *>());
    std::string text =
        QueryCharacters([&](std::size_t bytes, void *value, std::size_t *bytesReturned) {
            getInfoImpl(property, bytes, value, bytesReturned);
        });
    if (!text.empty())
        text.pop_back();
    return text;
}

std::string Device::name() const {
    return getStringInfo(Enum::DEVICEPROPERTY_NAME);
}

std::string Device::vendor() const {
    return getStringInfo(Enum::DEVICEPROPERTY_VENDOR);
}

std::string Device::extensions() const {
    return getStringInfo(Enum::DEVICEPROPERTY_EXTENSIONS);
}

Enum::Profile Device::profile() const {
    return ProfileOf(getStringInfo(Enum::DEVICEPROPERTY_PROFILE));
}

Device::Type Device::type() const {
    return static_cast<Type>(getInfo<std::uint64_t>(Enum::DEVICEPROPERTY_TYPE));
}

bool Device::supportsImages() const {
    return getInfo<unsigned int>(Enum::DEVICEPROPERTY_IMAGE_SUPPORT) != 0;
}

Platform Device::platform() const {
    return Platform(getInfo<cl_platform_id>(Enum::DEVICEPROPERTY_PLATFORM));
}

bool Device::isSupported(Enum::Extension extension) const {
    std::string const name = ExtensionManager::ExtensionEnumToString(extension);
    return extensions().find(name) != std::string::npos;
}

bool IsSupported(std::vector<Device> const &devices, Enum::Extension e) {
    return !devices.empty() && std::all_of(devices.begin(), devices.end(),
                                           [e](Device const &d) { return d.isSupported(e); });
}

} // namespace ORU::OCL
