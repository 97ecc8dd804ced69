// What an OpenCL device tells of itself.
#pragma once

#include "apps/oruinfo/report.h"

namespace ORU::OCL {
class Device;
} // namespace ORU::OCL

namespace OruInfo {

/// Adds every device property of OpenCL 1.1 in its type: enumerations and flags by their names,
/// sizes with their units. What the device does not tell says why.
void AddDeviceProperties(ORU::OCL::Device const &device, Group &group);

/// The words of a text, as extensions are listed in one.
Names Words(std::string const &text);

} // namespace OruInfo
