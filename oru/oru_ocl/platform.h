// An OpenCL platform.
#pragma once

#include "oru/oru_ocl/device.h"

#include <string>
#include <vector>

namespace ORU::OCL {

/// One installed OpenCL implementation. Platforms have no reference count: copies cost nothing.
///
/// The queries call clGetPlatformInfo; all but `devices` throw InternalException "id() != 0" for a
/// null handle. A failing call throws ExceptionOCL.
class ORU_API Platform : public OpenCLObjectWrapper<cl_platform_id> {
public:
    /// A platform of the runtime's, or null for none.
    explicit Platform(cl_platform_id platform) : OpenCLObjectWrapper(platform) {}

    std::string name() const;   ///< CL_PLATFORM_NAME
    std::string vendor() const; ///< CL_PLATFORM_VENDOR

    /// "OpenCL <major>.<minor> <anything>".
    std::string version() const;

    /// The extensions' names, separated by blanks.
    std::string extensions() const;

    Enum::Profile profile() const; ///< CL_PLATFORM_PROFILE

    /// The devices of a type in the runtime's order (clGetDeviceIDs).
    /// @throws ExceptionOCL CL_DEVICE_NOT_FOUND when there are none
    std::vector<Device> devices(Device::Type type) const;

    /// Whether the extension's name occurs in `extensions()`, also as a part of another name.
    bool isSupported(Enum::Extension extension) const;

private:
    std::string info(cl_platform_info query) const;
};

/// The installed platforms in the runtime's order (clGetPlatformIDs).
/// @throws ExceptionOCL when the runtime has none
ORU_API std::vector<Platform> platforms();

} // namespace ORU::OCL
