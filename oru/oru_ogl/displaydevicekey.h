// The name of a display device: one desktop output and the adapter that drives it.
#pragma once

#include "oru/core/utility/export.h"

#include <string>

namespace ORU::OGL {

/// Identifies one desktop output and its adapter; all texts are UTF-8, all empty by default.
///
/// Contexts carry the key of the device they live on, and contexts of one device share its
/// capability record. Make keys with `Context::DisplayDevice`.
struct ORU_API DisplayDeviceKey {
    DisplayDeviceKey() = default; ///< no device
    /// The members in order.
    DisplayDeviceKey(std::string const &display, std::string const &adapter,
                     std::string const &device)
        : displayName(display), adapterName(adapter), deviceID(device) {}

    std::string displayName; ///< the output's GDI device name, such as `\\.\DISPLAY1`
    std::string adapterName; ///< the adapter's description
    std::string deviceID;    ///< the adapter's PCI device id in decimal
};

} // namespace ORU::OGL
