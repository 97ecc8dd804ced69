// The base of OpenCL buffers and images.
#include "oru/oru_ocl/memory.h"

#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ocl/internal/enumtable.h"

namespace ORU::OCL {

namespace {

constexpr cl_mem_flags accessFlags[] = {CL_MEM_READ_ONLY, CL_MEM_WRITE_ONLY, CL_MEM_READ_WRITE};

constexpr unsigned int memoryInfos[] = {
    CL_MEM_TYPE,      CL_MEM_FLAGS,           CL_MEM_SIZE,    CL_MEM_HOST_PTR,
    CL_MEM_MAP_COUNT, CL_MEM_REFERENCE_COUNT, CL_MEM_CONTEXT,
};

constexpr unsigned int objectTypes[] = {
    CL_MEM_OBJECT_BUFFER,
    CL_MEM_OBJECT_IMAGE2D,
    CL_MEM_OBJECT_IMAGE3D,
};

} // namespace

void Memory::getInfo(MemoryInfo info, std::size_t size, void *value,
                     std::size_t *sizeReturned) const {
    ORU_CL(GetMemObjectInfo, id(), ConvertMemoryInfo(info), size, value, sizeReturned);
}

Memory::MemoryObjectType Memory::memType() const {
    cl_mem_object_type type = 0;
    getInfo(MEMORYINFO_TYPE, sizeof type, &type, nullptr);
    return static_cast<MemoryObjectType>(IndexOf(objectTypes, type));
}

cl_mem_flags Memory::AccessFlags(MemoryAccessFlags access) {
    return ConstantOr(accessFlags, access, cl_mem_flags(0));
}

unsigned int Memory::ConvertMemoryInfo(MemoryInfo info) {
    return ConstantOr(memoryInfos, info, 0u);
}

unsigned int Memory::ConvertMemoryObjectType(MemoryObjectType type) {
    return ConstantOr(objectTypes, type, 0u);
}

cl_mem_flags Memory::AllocationFlags(MemoryAccessFlags access, bool allocHost) {
    return AccessFlags(access) | (allocHost ? CL_MEM_ALLOC_HOST_PTR : 0);
}

} // namespace ORU::OCL
