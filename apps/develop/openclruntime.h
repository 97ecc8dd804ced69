// The OpenCL runtime of this machine, if it has one.
#pragma once

#include <memory>
#include <string>

namespace ORU {
namespace OCL {
class AutoInitializer;
} // namespace OCL
} // namespace ORU

namespace Develop {

/// Loads the OpenCL runtime. That a machine has none is no failure.
class OpenCLRuntime {
public:
    OpenCLRuntime();
    ~OpenCLRuntime();
    OpenCLRuntime(OpenCLRuntime &&) noexcept;
    OpenCLRuntime &operator=(OpenCLRuntime &&) noexcept;

    bool isAvailable() const { return library_ != nullptr; }

    /// The names of the platforms, or that there is no runtime, for people.
    std::string description() const;

private:
    std::unique_ptr<ORU::OCL::AutoInitializer> library_;
};

} // namespace Develop
