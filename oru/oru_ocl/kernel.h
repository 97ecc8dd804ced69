// OpenCL kernels: functions of a program that are launched on a device.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/oru_ocl/openclobjectwrapper.h"

#include <cstddef>

namespace ORU::OCL {

/// A kernel with its arguments, made by `Program::kernel` and launched by
/// `CommandQueue::enqueueKernel`. Copies are the same kernel and share the arguments.
class ORU_API Kernel : public OpenCLObjectWrapper<cl_kernel> {
public:
    /// Sets an argument from raw bytes (clSetKernelArg): a scalar, a vector, the address of a
    /// `handle()`, or null with the size of a piece of local memory.
    /// @param index argument number from 0
    /// @param size bytes
    /// @throws ExceptionOCL when the runtime refuses
    void setArg(unsigned int index, void const *value, std::size_t size);

    /// Sets an argument to a Buffer or an Image2D, or to a TVec2 or TVec4 of float or int, which
    /// the kernel sees as float2, float4, int2 or int4.
    /// @throws ExceptionOCL when the runtime refuses
    template<class T>
    void setArg(unsigned int index, T const &value);

private:
    friend class Program;

    /// Takes over the caller's reference.
    explicit Kernel(cl_kernel kernel) : OpenCLObjectWrapper(kernel) {}

    /// Adds a reference of its own.
    Kernel(cl_kernel kernel, add_ref_tag const &tag) : OpenCLObjectWrapper(kernel, tag) {}
};

} // namespace ORU::OCL
