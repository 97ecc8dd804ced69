// OpenCL kernels: functions of a program that are launched on a device.
#include "oru/oru_ocl/kernel.h"

#include "oru/core/math/tvec2.h"
#include "oru/core/math/tvec4.h"
#include "oru/core/utility/composetext.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ocl/internal/infoquery.h"

namespace ORU::OCL {

using ambra::lumo::TVec2;
using ambra::lumo::TVec4;

// What `Kernel::setArg` passes is what the kernel's vector types hold.
static_assert(sizeof(TVec2<float>) == sizeof(cl_float2) && sizeof(TVec2<int>) == sizeof(cl_int2));
static_assert(sizeof(TVec4<float>) == sizeof(cl_float4) && sizeof(TVec4<int>) == sizeof(cl_int4));

void Kernel::noteArgument(LogicalException &failure, unsigned int index, std::size_t size) const {
    std::string name = "?";
    DropExceptions([&] {
        name = QueryText([&](std::size_t bytes, void *value, std::size_t *bytesReturned) {
            ORU_CL(GetKernelInfo, id(), CL_KERNEL_FUNCTION_NAME, bytes, value, bytesReturned);
        });
    });
    failure.addNote(
        ComposeText("argument ", index, " of kernel ", name, " given ", size, " bytes"));
}

} // namespace ORU::OCL
