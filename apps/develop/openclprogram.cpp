// OpenCL programs of develop.
#include "apps/develop/openclprogram.h"

#include "apps/common/failure.h"

#include "oru/oru_ocl/exceptionocl.h"

namespace Develop {

namespace OCL = ORU::OCL;

OCL::Program BuildProgram(OCL::Context const &context, OCL::Device const &device,
                          char const *source, std::string const &options) {
    OCL::Program program(context, source);
    try {
        program.build(options);
    } catch (OCL::ExceptionOCL const &) {
        std::string const log = program.buildLog(device);
        throw App::Failure("the OpenCL compiler refuses the kernels: " +
                           log.substr(0, log.find('\n')));
    }
    return program;
}

OCL::Buffer &ReusedBuffer::reserve(OCL::Context const &context, std::size_t bytes) {
    if (!buffer_ || bytes_ < bytes) {
        buffer_.reset(); // first, that both are not there at once
        buffer_.emplace(context, OCL::Memory::MEMORY_READ_WRITE, false, bytes);
        bytes_ = bytes;
    }
    return *buffer_;
}

} // namespace Develop
