// The base of OpenCL buffers and images.
#include "oru/oru_ocl/memory.h"

#include "oru/core/utility/composetext.h"
#include "oru/core/utility/enumtable.h"
#include "oru/oru_ocl/clcall.h"

namespace ORU::OCL {

namespace {

constexpr EnumTable<Memory::MemoryAccessFlags, cl_mem_flags, 3> kAccessFlags = {
    {{Memory::MEMORY_READ_ONLY, CL_MEM_READ_ONLY},
     {Memory::MEMORY_WRITE_ONLY, CL_MEM_WRITE_ONLY},
     {Memory::MEMORY_READ_WRITE, CL_MEM_READ_WRITE}}};
static_assert(kAccessFlags.isInOrder());

constexpr EnumTable<Memory::MemoryInfo, cl_mem_info, 7> kMemoryInfos = {
    {{Memory::MEMORYINFO_TYPE, CL_MEM_TYPE},
     {Memory::MEMORYINFO_FLAGS, CL_MEM_FLAGS},
     {Memory::MEMORYINFO_SIZE, CL_MEM_SIZE},
     {Memory::MEMORYINFO_HOST_PTR, CL_MEM_HOST_PTR},
     {Memory::MEMORYINFO_MAP_COUNT, CL_MEM_MAP_COUNT},
     {Memory::MEMORYINFO_REFERENCE_COUNT, CL_MEM_REFERENCE_COUNT},
     {Memory::MEMORYINFO_CONTEXT, CL_MEM_CONTEXT}}};
static_assert(kMemoryInfos.isInOrder());

constexpr EnumTable<Memory::MemoryObjectType, cl_mem_object_type, 3> kObjectTypes = {
    {{Memory::MEMORYOBJECTTYPE_BUFFER, CL_MEM_OBJECT_BUFFER},
     {Memory::MEMORYOBJECTTYPE_IMAGE2D, CL_MEM_OBJECT_IMAGE2D},
     {Memory::MEMORYOBJECTTYPE_IMAGE3D, CL_MEM_OBJECT_IMAGE3D}}};
static_assert(kObjectTypes.isInOrder());

/// By MemoryObjectType.
constexpr char const *kTypeNames[] = {"a buffer", "a 2-D image", "a 3-D image",
                                      "of a type that OpenCL 1.1 does not have"};

Memory::MemoryObjectType TypeOf(cl_mem handle) {
    cl_mem_object_type type = 0;
    ORU_CL(GetMemObjectInfo, handle, CL_MEM_TYPE, sizeof type, &type, nullptr);
    return kObjectTypes.valueOr(type, Memory::MEMORYOBJECTTYPE_OTHER);
}

} // namespace

void Memory::getInfo(MemoryInfo info, std::size_t size, void *value,
                     std::size_t *sizeReturned) const {
    ORU_CL(GetMemObjectInfo, id(), ConvertMemoryInfo(info), size, value, sizeReturned);
}

Memory::MemoryObjectType Memory::memType() const {
    return TypeOf(id());
}

cl_mem Memory::Checked(cl_mem handle, MemoryObjectType type) {
    if (MemoryObjectType const actual = TypeOf(handle); actual != type)
        ORU_THROW_INTERNAL("The memory to make ", kTypeNames[type], " of is ", kTypeNames[actual]);
    return handle;
}

cl_mem_flags Memory::AccessFlags(MemoryAccessFlags access) {
    return kAccessFlags.constantOr(access, 0);
}

unsigned int Memory::ConvertMemoryInfo(MemoryInfo info) {
    return kMemoryInfos.constantOr(info, 0);
}

unsigned int Memory::ConvertMemoryObjectType(MemoryObjectType type) {
    return kObjectTypes.constantOr(type, 0);
}

cl_mem_flags Memory::AllocationFlags(MemoryAccessFlags access, bool allocHost) {
    return AccessFlags(access) | (allocHost ? CL_MEM_ALLOC_HOST_PTR : 0);
}

} // namespace ORU::OCL
