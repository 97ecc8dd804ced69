// With which type each device property is read.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/oru_ocl/devicepropertyenum.h"
#include "oru/oru_ocl/openclheaders.h"

#include <string>
#include <typeinfo>

/// Enumerations of the compute layer: device properties, extensions, profiles.
namespace ORU::OCL::Enum {

/// A text that stands for the type `T`; equal texts mean equal types.
template<class T>
std::string const &GetTypeName() {
    static std::string const kName = typeid(T).name();
    return kName;
}

/// Read as a handle, whatever the headers make of it.
template<>
inline std::string const &GetTypeName<cl_platform_id>() {
    static std::string const kName = "cl_platform_id";
    return kName;
}

/// The type name of what `Device::getInfo` reads for `property`; empty for a property that it does
/// not read, and for all of them until `Library::Initialize` ran.
/// @throws InternalException "property_index < table_size" for a value that is no property
ORU_API std::string const &GetPropertyTypeName(DeviceProperty property);

/// What a failed read of `property` says about the type that it has and the one it was read as.
/// @param read the `GetTypeName` of the latter
ORU_API std::string DescribeTypes(DeviceProperty property, std::string const &read);

} // namespace ORU::OCL::Enum
