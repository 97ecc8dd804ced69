// An OpenCL device.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ocl/deviceproperty.h"
#include "oru/oru_ocl/extensionenum.h"
#include "oru/oru_ocl/openclobjectwrapper.h"
#include "oru/oru_ocl/profile.h"

#include <cstddef>
#include <string>
#include <type_traits>
#include <vector>

namespace ORU::OCL {

class Platform;

/// One device of a platform. Devices have no reference count: copies cost nothing.
///
/// The queries call clGetDeviceInfo and throw InternalException "id() != 0" for a null handle,
/// ExceptionOCL when the call fails.
class ORU_API Device : public OpenCLObjectWrapper<cl_device_id> {
public:
    /// The CL_DEVICE_TYPE_* bits, combinable.
    enum Type : unsigned int {
        TYPE_DEFAULT = CL_DEVICE_TYPE_DEFAULT,         ///< the one that the runtime prefers
        TYPE_CPU = CL_DEVICE_TYPE_CPU,                 ///< the host's processor
        TYPE_GPU = CL_DEVICE_TYPE_GPU,                 ///< a graphics processor
        TYPE_ACCELERATOR = CL_DEVICE_TYPE_ACCELERATOR, ///< something else, on a bus
        TYPE_ALL = CL_DEVICE_TYPE_ALL                  ///< any device
    };

    /// A device of the runtime's, or null for none.
    explicit Device(cl_device_id device) : OpenCLObjectWrapper(device) {}

    /// @name Properties
    /// clGetDeviceInfo of CL_DEVICE_NAME and so on. `type` has the bits of all types that the
    /// device is.
    /// @{
    std::string name() const;
    std::string vendor() const;

    /// The extensions' names, separated by blanks.
    std::string extensions() const;

    Enum::Profile profile() const;
    Type type() const;
    bool supportsImages() const;
    Platform platform() const;
    /// @}

    /// Whether the extension's name occurs in `extensions()`, also as a part of another name.
    bool isSupported(Enum::Extension extension) const;

    /// Reads a property as the type that `Enum::GetPropertyTypeName` tells: `unsigned int`,
    /// `std::uint64_t`, `Range<3>` or `cl_platform_id`; `std::string` for the texts.
    /// @throws InternalException "property_typename == type_name" (for a text
    ///     "GetPropertyTypeName(property) == Enum::GetTypeName<char*>()") for another type
    template<class T>
    T getInfo(Enum::DeviceProperty property) const {
        if constexpr (std::is_same_v<T, std::string>) {
            return getStringInfo(property);
        } else {
            ORU_ASSERT_NOTED("property_typename == type_name",
                             Enum::DescribeTypes(property, Enum::GetTypeName<T>()),
                             Enum::GetPropertyTypeName(property) == Enum::GetTypeName<T>());
            T value;
            getInfoImpl(property, sizeof(T), &value, nullptr);
            return value;
        }
    }

private:
    void getInfoImpl(Enum::DeviceProperty property, std::size_t size, void *value,
                     std::size_t *sizeReturned) const;
    std::string getStringInfo(Enum::DeviceProperty property) const;
};

/// Whether every device supports the extension; false for an empty list.
ORU_API bool IsSupported(std::vector<Device> const &devices, Enum::Extension e);

} // namespace ORU::OCL
