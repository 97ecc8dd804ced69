// The OpenCL runtime of this machine, if it has one, and its devices.
#pragma once

#include "oru/oru_ocl/platform.h"

#include <memory>
#include <string>
#include <vector>

namespace ORU {
namespace OCL {
class AutoInitializer;
} // namespace OCL
} // namespace ORU

namespace Develop {

/// A device with its platform.
struct OpenCLDevice {
    ORU::OCL::Platform platform;
    ORU::OCL::Device device;
    std::string name; ///< "PLATFORM.DEVICE DEVICENAME (PLATFORMNAME)", the numbers from 0
};

/// Loads the OpenCL runtime for its lifetime. That a machine has none is no failure.
class OpenCLRuntime {
public:
    /// @param folder where the runtime's OpenCL.dll lies; empty for the system's folder
    explicit OpenCLRuntime(std::string const &folder);
    ~OpenCLRuntime();
    OpenCLRuntime(OpenCLRuntime const &) = delete;
    OpenCLRuntime &operator=(OpenCLRuntime const &) = delete;

    bool isAvailable() const { return library_ != nullptr; }

    /// The names of the platforms, or that there is no runtime, for people.
    std::string description() const;

    /// The devices of all platforms; none without a runtime.
    std::vector<OpenCLDevice> devices() const;

private:
    std::unique_ptr<ORU::OCL::AutoInitializer> library_;
};

} // namespace Develop
