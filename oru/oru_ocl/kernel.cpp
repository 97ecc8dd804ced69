// OpenCL kernels: functions of a program that are launched on a device.
#include "oru/oru_ocl/kernel.h"

#include "oru/core/math/tvec2.h"
#include "oru/core/math/tvec4.h"
#include "oru/oru_ocl/bufferocl.h"
#include "oru/oru_ocl/image.h"
#include "oru/oru_ocl/internal/clcall.h"

namespace ORU::OCL {

using ambra::lumo::TVec2;
using ambra::lumo::TVec4;

static_assert(sizeof(TVec2<float>) == sizeof(cl_float2) && sizeof(TVec2<int>) == sizeof(cl_int2));
static_assert(sizeof(TVec4<float>) == sizeof(cl_float4) && sizeof(TVec4<int>) == sizeof(cl_int4));

void Kernel::setArg(unsigned int index, void const *value, std::size_t size) {
    ORU_CL(SetKernelArg)(id(), index, size, value);
}

template<class T>
void Kernel::setArg(unsigned int index, T const &value) {
    if constexpr (std::is_base_of_v<Memory, T>)
        setArg(index, &value.id(), sizeof(cl_mem));
    else
        setArg(index, &value, sizeof value);
}

template ORU_API void Kernel::setArg(unsigned int, Buffer const &);
template ORU_API void Kernel::setArg(unsigned int, Image2D const &);
template ORU_API void Kernel::setArg(unsigned int, TVec2<float> const &);
template ORU_API void Kernel::setArg(unsigned int, TVec4<float> const &);
template ORU_API void Kernel::setArg(unsigned int, TVec2<int> const &);
template ORU_API void Kernel::setArg(unsigned int, TVec4<int> const &);

} // namespace ORU::OCL
