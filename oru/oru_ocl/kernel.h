// OpenCL kernels: functions of a program that are launched on a device.
#pragma once

#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ocl/openclobjectwrapper.h"

#include <cstddef>
#include <type_traits>
#include <utility>

namespace ORU::OCL {

/// A kernel with its arguments, made by `Program::kernel` and launched by
/// `CommandQueue::enqueueKernel`. Copies are the same kernel and share the arguments.
///
/// ```cpp
/// Kernel brighten = program.kernel("brighten");
/// brighten.setArg(0, buffer);
/// brighten.setArg(1, 2.0f);
/// brighten.setArg(2, nullptr, 64 * sizeof(float)); // local memory
/// ```
class ORU_API Kernel : public OpenCLObjectWrapper<cl_kernel> {
public:
    /// @name Over a handle that was made elsewhere
    /// The tag tells whose reference the object holds.
    /// @{
    Kernel(cl_kernel handle, take_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    Kernel(cl_kernel handle, add_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    /// @}

    /// Sets an argument from raw bytes (clSetKernelArg), for example null with the size of a piece
    /// of local memory.
    /// @param index argument number from 0
    /// @param size bytes
    /// @throws ExceptionOCL when the runtime refuses, with a note of kernel, argument and size
    void setArg(unsigned int index, void const *value, std::size_t size) {
        try {
            ORU_CL(SetKernelArg, id(), index, size, value);
        } catch (LogicalException &failure) {
            noteArgument(failure, index, size);
            throw;
        }
    }

    /// Sets an argument to a memory object or a sampler, or to a plain value: a TVec2 or TVec4 of
    /// float or int is the kernel's float2, float4, int2 or int4, a float its float.
    /// @throws ExceptionOCL when the runtime refuses
    template<class T>
    void setArg(unsigned int index, T const &value) {
        // Inline, as the call itself takes no longer than one through another module.
        if constexpr (IsWrapper<T>::value) {
            setArg(index, &value.id(), sizeof value.id());
        } else {
            static_assert(std::is_trivially_copyable_v<T> && !std::is_pointer_v<T>,
                          "an argument is an object of the layer or a plain value");
            setArg(index, &value, sizeof value);
        }
    }

private:
    friend class Program;

    template<class T, class = void>
    struct IsWrapper : std::false_type {};
    template<class T>
    struct IsWrapper<T, std::void_t<decltype(std::declval<T const &>().handle())>>
        : std::true_type {};

    /// Notes which argument of which kernel was set.
    ORU_COLD void noteArgument(LogicalException &failure, unsigned int index,
                               std::size_t size) const;

    /// Takes over the caller's reference.
    explicit Kernel(cl_kernel kernel) : OpenCLObjectWrapper(kernel) {}
};

} // namespace ORU::OCL
