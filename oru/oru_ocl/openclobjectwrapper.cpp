// What retains and releases each kind of OpenCL handle.
#include "oru/oru_ocl/openclobjectwrapper.h"

#include "oru/oru_ocl/clcall.h"

namespace ORU::OCL {

namespace {

template<class T>
using CountSlot = cl_int (CL_API_CALL *FunctionTable::*)(T);

template<class T>
constexpr CountSlot<T> kRetainSlot = nullptr;
template<class T>
constexpr CountSlot<T> kReleaseSlot = nullptr;

#define ORU_CL_COUNTED(Handle, Kind)                                                               \
    template<>                                                                                     \
    constexpr CountSlot<Handle> kRetainSlot<Handle> = &FunctionTable::clRetain##Kind;              \
    template<>                                                                                     \
    constexpr CountSlot<Handle> kReleaseSlot<Handle> = &FunctionTable::clRelease##Kind;

ORU_CL_COUNTED(cl_context, Context)
ORU_CL_COUNTED(cl_command_queue, CommandQueue)
ORU_CL_COUNTED(cl_mem, MemObject)
ORU_CL_COUNTED(cl_sampler, Sampler)
ORU_CL_COUNTED(cl_program, Program)
ORU_CL_COUNTED(cl_kernel, Kernel)
ORU_CL_COUNTED(cl_event, Event)

template<class T>
int Count([[maybe_unused]] CountSlot<T> slot, [[maybe_unused]] T handle) {
    if constexpr (kRetainSlot<T> != nullptr)
        if (handle)
            return (Table().*slot)(handle);
    return 0;
}

} // namespace

template<class T>
int RetainHandle(T handle) {
    return Count<T>(kRetainSlot<T>, handle);
}

template<class T>
int ReleaseHandle(T handle) {
    return Count<T>(kReleaseSlot<T>, handle);
}

#define ORU_CL_HANDLE(Handle)                                                                      \
    template ORU_API int RetainHandle(Handle);                                                     \
    template ORU_API int ReleaseHandle(Handle);
#include "oru/oru_ocl/openclhandles.inc"

} // namespace ORU::OCL
