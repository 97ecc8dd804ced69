// An OpenCL platform.
#include "oru/oru_ocl/platform.h"

#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ocl/internal/infoquery.h"
#include "oru/oru_ocl/internal/profiletext.h"

namespace ORU::OCL {

std::string Platform::info(cl_platform_info query) const {
    ORU_ASSERT(id() != 0);
    return QueryText([&](std::size_t bytes, void *value, std::size_t *bytesReturned) {
        ORU_CL(GetPlatformInfo, id(), query, bytes, value, bytesReturned);
    });
}

std::string Platform::name() const {
    return info(CL_PLATFORM_NAME);
}

std::string Platform::vendor() const {
    return info(CL_PLATFORM_VENDOR);
}

std::string Platform::version() const {
    return info(CL_PLATFORM_VERSION);
}

std::string Platform::extensions() const {
    return info(CL_PLATFORM_EXTENSIONS);
}

Enum::Profile Platform::profile() const {
    return ProfileOf(info(CL_PLATFORM_PROFILE));
}

std::vector<Device> Platform::devices(Device::Type type) const {
    auto const ids =
        QueryHandles<cl_device_id>([&](cl_uint count, cl_device_id *devices, cl_uint *found) {
            ORU_CL(GetDeviceIDs, id(), cl_device_type(type), count, devices, found);
        });
    return std::vector<Device>(ids.begin(), ids.end());
}

bool Platform::isSupported(Enum::Extension extension) const {
    std::string const name = ExtensionManager::ExtensionEnumToString(extension);
    return extensions().find(name) != std::string::npos;
}

std::vector<Platform> platforms() {
    auto const ids =
        QueryHandles<cl_platform_id>([](cl_uint count, cl_platform_id *platforms, cl_uint *found) {
            ORU_CL(GetPlatformIDs, count, platforms, found);
        });
    return std::vector<Platform>(ids.begin(), ids.end());
}

} // namespace ORU::OCL
