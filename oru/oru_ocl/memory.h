// The base of OpenCL buffers and images.
#pragma once

#include "oru/oru_ocl/contextocl.h"

#include <cstddef>

namespace ORU::OCL {

/// A piece of device memory, or none.
class ORU_API Memory : public OpenCLObjectWrapper<cl_mem> {
public:
    /// What kernels may do with it. Any other value leaves it to the runtime (read and write).
    enum MemoryAccessFlags : int {
        MEMORY_READ_ONLY = 0,  ///< CL_MEM_READ_ONLY
        MEMORY_WRITE_ONLY = 1, ///< CL_MEM_WRITE_ONLY
        MEMORY_READ_WRITE = 2  ///< CL_MEM_READ_WRITE
    };

    /// What `getInfo` can ask, with the type of its answer.
    enum MemoryInfo : int {
        MEMORYINFO_TYPE = 0,            ///< cl_mem_object_type
        MEMORYINFO_FLAGS = 1,           ///< cl_mem_flags
        MEMORYINFO_SIZE = 2,            ///< std::size_t, in bytes
        MEMORYINFO_HOST_PTR = 3,        ///< void *
        MEMORYINFO_MAP_COUNT = 4,       ///< cl_uint
        MEMORYINFO_REFERENCE_COUNT = 5, ///< cl_uint
        MEMORYINFO_CONTEXT = 6          ///< cl_context, not retained
    };

    /// What `memType` tells.
    enum MemoryObjectType : int {
        MEMORYOBJECTTYPE_BUFFER = 0,  ///< a Buffer
        MEMORYOBJECTTYPE_IMAGE2D = 1, ///< an Image2D
        MEMORYOBJECTTYPE_IMAGE3D = 2, ///< an Image3D
        MEMORYOBJECTTYPE_OTHER = 3    ///< a type that OpenCL 1.1 does not have
    };

    /// No memory.
    Memory() = default;

    /// @name Over a handle that was made elsewhere
    /// The tag tells whose reference the object holds.
    /// @{
    Memory(cl_mem handle, take_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    Memory(cl_mem handle, add_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    /// @}

    /// Reads one property (clGetMemObjectInfo).
    /// @param size bytes at `value`, which may be null to ask for the size only
    /// @param sizeReturned receives the size of the answer in bytes; may be null
    /// @throws ExceptionOCL when the runtime refuses
    void getInfo(MemoryInfo info, std::size_t size, void *value, std::size_t *sizeReturned) const;

    /// What kind of memory this is.
    /// @throws ExceptionOCL when the runtime refuses
    MemoryObjectType memType() const;

protected:
    /// Takes over the caller's reference.
    explicit Memory(cl_mem handle) : OpenCLObjectWrapper(handle) {}

    /// A handle that was made elsewhere, which must be memory of a type.
    /// @throws InternalException when it is of another type, ExceptionOCL when it is none
    static cl_mem Checked(cl_mem handle, MemoryObjectType type);

    /// @name Translations into OpenCL's constants
    /// 0 for a value outside the enumeration.
    /// @{
    static cl_mem_flags AccessFlags(MemoryAccessFlags access);
    static unsigned int ConvertMemoryInfo(MemoryInfo info);
    /// Called by nobody here; has its place in the binary interface.
    static unsigned int ConvertMemoryObjectType(MemoryObjectType type);
    /// @}

    /// The flags of memory that the runtime allocates, in host memory when `allocHost` is set.
    static cl_mem_flags AllocationFlags(MemoryAccessFlags access, bool allocHost);
};

} // namespace ORU::OCL
