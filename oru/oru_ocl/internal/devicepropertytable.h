// Fills the table of deviceproperty.h.
#pragma once

namespace ORU::OCL {

/// Part of the layer's initialisation, under its lock.
void FillDevicePropertyTable();

} // namespace ORU::OCL
