// OpenCL buffers: one-dimensional device memory.
#pragma once

#include "oru/oru_ocl/memory.h"

namespace ORU::OGL {
class Buffer;
}

namespace ORU::OCL {

/// An OpenCL buffer.
///
/// The constructors throw ExceptionOCL when the runtime refuses.
class ORU_API Buffer : public Memory {
public:
    /// A buffer whose storage is the caller's memory, which must outlive it (clCreateBuffer with
    /// CL_MEM_USE_HOST_PTR).
    /// @param size bytes
    /// @throws InternalException when `host` is null
    Buffer(Context const &context, MemoryAccessFlags access, std::size_t size, void *host);

    /// A buffer of undefined content (clCreateBuffer).
    /// @param allocHost whether to allocate it in memory that the host reaches quickly
    /// @param size bytes
    Buffer(Context const &context, MemoryAccessFlags access, bool allocHost, std::size_t size);

    /// A buffer that starts with a copy of the caller's memory (clCreateBuffer with
    /// CL_MEM_COPY_HOST_PTR); parameters as above.
    /// @throws InternalException when `host` is null
    Buffer(Context const &context, MemoryAccessFlags access, bool allocHost, std::size_t size,
           void *host);

    /// A buffer over the storage that an OpenGL buffer has now (clCreateFromGLBuffer). The context
    /// must share with the OpenGL buffer's context, and the OpenGL buffer must outlive this one.
    /// Commands use it between `CommandQueue::enqueueAcquireGLObjects` and
    /// `enqueueReleaseGLObjects`.
    Buffer(Context const &context, MemoryAccessFlags access, OGL::Buffer &buffer);

    /// @name Over a handle that was made elsewhere
    /// @throws InternalException when it is memory of another type
    /// @{
    Buffer(cl_mem handle, take_ref_tag const &tag)
        : Memory(Checked(handle, MEMORYOBJECTTYPE_BUFFER), tag) {}
    Buffer(cl_mem handle, add_ref_tag const &tag)
        : Memory(Checked(handle, MEMORYOBJECTTYPE_BUFFER), tag) {}
    /// @}
};

} // namespace ORU::OCL
