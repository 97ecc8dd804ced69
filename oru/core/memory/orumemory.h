// The memory hooks: how a host routes the library's own heap allocations through its allocator.
#pragma once

#include "oru/core/utility/export.h"

#include <cstddef>

namespace ORU {

/// What an allocation is for; passed on to the hooks.
enum MemoryType {
    MEMORYTYPE_DEFAULT = 0, ///< objects of the library
    MEMORYTYPE_IMAGE = 1    ///< aligned image buffers
};

} // namespace ORU

namespace ORU_private {

using AllocationFunction = void *(*)(std::size_t size, ORU::MemoryType type, char const *file,
                                     int line);
using DeallocationFunction = void (*)(void *p, ORU::MemoryType type, char const *file, int line);
using ExecutableAllocationFunction = void *(*)(std::size_t size, char const *file, int line);
using ExecutableDeallocationFunction = void (*)(void *p, char const *file, int line);
using MemoryCheckFunction = bool (*)(void const *p, std::size_t size);

// The hooks, null until the host sets them. Written once at start-up and read without a lock.
extern ORU_API AllocationFunction gAllocationFunction;
extern ORU_API DeallocationFunction gDeallocationFunction;
/// Neither set nor called by the library; has its place in the binary interface.
extern ORU_API ExecutableAllocationFunction gExecutableAllocationFunction;
/// The counterpart; has its place in the binary interface.
extern ORU_API ExecutableDeallocationFunction gExecutableDeallocationFunction;
/// Kept, never called by the library; has its place in the binary interface.
extern ORU_API MemoryCheckFunction gMemoryCheckFunction;

} // namespace ORU_private

/// Allocates through the allocation hook, or through the standard `operator new` without one.
/// @param size bytes
/// @param file, line position of the allocating statement; `ORU_NEW` fills them in
/// @return what the hook returns, unchecked: a hook must not return null
/// @throws std::bad_alloc from the standard path; whatever the hook throws
ORU_API void *operator new(std::size_t size, ORU::MemoryType type, char const *file, int line);

/// Frees through the deallocation hook, or through the standard `operator delete` without one.
/// The compiler calls it when a constructor throws inside the matching `new`; a hook must not
/// throw. Do not install hooks between an allocation and its release.
ORU_API void operator delete(void *p, ORU::MemoryType type, char const *file, int line) noexcept;

/// `ORU_NEW T(arguments)` makes a heap object through the hooks, tagged with this source position.
/// Hand it to a `ScopedPtr<T>` or `MakeShared` at once.
#define ORU_NEW new (::ORU::MEMORYTYPE_DEFAULT, __FILE__, __LINE__)

namespace ORU {

/// Installs both hooks, before the library allocates anything and at most once. Null pointers are
/// accepted and leave the standard allocator in place.
/// @throws InternalException when either hook is already set; the hooks then stay as they were
ORU_API void SetAllocationDeallocationFunction(ORU_private::AllocationFunction alloc,
                                               ORU_private::DeallocationFunction dealloc);

/// Installs the memory-check hook, at most once.
/// @throws InternalException when one is already set
ORU_API void SetMemoryCheckFunction(ORU_private::MemoryCheckFunction check);

} // namespace ORU
