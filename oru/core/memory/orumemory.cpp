// The memory hooks: how a host routes the library's own heap allocations through its allocator.
#include "oru/core/memory/orumemory.h"

#include "oru/core/exceptions/checks.h"

#include <new>

namespace ORU_private {

AllocationFunction gAllocationFunction = nullptr;
DeallocationFunction gDeallocationFunction = nullptr;
ExecutableAllocationFunction gExecutableAllocationFunction = nullptr;
ExecutableDeallocationFunction gExecutableDeallocationFunction = nullptr;
MemoryCheckFunction gMemoryCheckFunction = nullptr;

} // namespace ORU_private

void *operator new(std::size_t size, ORU::MemoryType type, char const *file, int line) {
    if (ORU_private::gAllocationFunction)
        return ORU_private::gAllocationFunction(size, type, file, line);
    return ::operator new(size);
}

void operator delete(void *p, ORU::MemoryType type, char const *file, int line) noexcept {
    if (ORU_private::gDeallocationFunction)
        ORU_private::gDeallocationFunction(p, type, file, line);
    else
        ::operator delete(p);
}

namespace ORU {

void SetAllocationDeallocationFunction(ORU_private::AllocationFunction alloc,
                                       ORU_private::DeallocationFunction dealloc) {
    ORU_ASSERT(ORU_private::gAllocationFunction == NULL);
    ORU_ASSERT(ORU_private::gDeallocationFunction == NULL);
    ORU_private::gAllocationFunction = alloc;
    ORU_private::gDeallocationFunction = dealloc;
}

void SetMemoryCheckFunction(ORU_private::MemoryCheckFunction check) {
    ORU_ASSERT(ORU_private::gMemoryCheckFunction == NULL);
    ORU_private::gMemoryCheckFunction = check;
}

} // namespace ORU
