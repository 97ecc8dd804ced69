// OpenCL buffers: one-dimensional device memory.
#include "oru/oru_ocl/bufferocl.h"

#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"

namespace ORU::OCL {

Buffer::Buffer(Context const &context, MemoryAccessFlags access, std::size_t size, void *host) {
    ORU_ASSERT_TEXT("NULL host memory pointer passed to Buffer constructor.", host);
    cl_mem_flags const flags = AccessFlags(access) | CL_MEM_USE_HOST_PTR;
    adopt(ORU_CL(CreateBuffer, context.id(), flags, size, host));
}

Buffer::Buffer(Context const &context, MemoryAccessFlags access, bool allocHost, std::size_t size)
    : Memory(
          ORU_CL(CreateBuffer, context.id(), AllocationFlags(access, allocHost), size, nullptr)) {}

Buffer::Buffer(Context const &context, MemoryAccessFlags access, bool allocHost, std::size_t size,
               void *host) {
    ORU_ASSERT_TEXT("Must allocate host memory passed to Buffer constructor.", host);
    cl_mem_flags const flags = AllocationFlags(access, allocHost) | CL_MEM_COPY_HOST_PTR;
    adopt(ORU_CL(CreateBuffer, context.id(), flags, size, host));
}

Buffer::Buffer(Context const &context, MemoryAccessFlags access, OGL::Buffer &buffer)
    : Memory(ORU_CL(CreateFromGLBuffer, context.id(), AccessFlags(access), buffer.checkedID())) {}

} // namespace ORU::OCL
