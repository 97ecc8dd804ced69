// OpenCL programs of develop.
#pragma once

#include "oru/oru_ocl/bufferocl.h"
#include "oru/oru_ocl/programocl.h"

#include <cstddef>
#include <optional>
#include <string>

namespace Develop {

/// Builds a program for a device.
/// @throws Failure when the device's compiler refuses it
ORU::OCL::Program BuildProgram(ORU::OCL::Context const &context, ORU::OCL::Device const &device,
                               char const *source, std::string const &options);

/// A buffer that is made anew only when more is needed.
class ReusedBuffer {
public:
    /// A buffer of at least this many bytes, with any content.
    ORU::OCL::Buffer &reserve(ORU::OCL::Context const &context, std::size_t bytes);

    ORU::OCL::Buffer &get() { return *buffer_; }

private:
    std::optional<ORU::OCL::Buffer> buffer_;
    std::size_t bytes_ = 0;
};

} // namespace Develop
