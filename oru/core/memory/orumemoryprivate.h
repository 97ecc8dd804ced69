// Aligned image memory through the hooks, and its deleter.
#pragma once

#include "oru/core/memory/orumemory.h"

#include <cstdint>

namespace ORU_private {

/// Allocates `size` bytes at an address that is a multiple of `alignment`, in one raw block of
/// size + 8 + alignment bytes; the 8 bytes below the result hold the raw block's address.
/// @param type `MEMORYTYPE_IMAGE` reaches the hook as such, any other as `MEMORYTYPE_DEFAULT`
/// @param size bytes
/// @param alignment positive, in bytes
/// @throws std::bad_alloc from the standard path
ORU_API void *NewAlignedMemory(ORU::MemoryType type, std::size_t size, int alignment);

/// Frees what `NewAlignedMemory` returned for the same `type`; null is ignored.
ORU_API void DeleteAlignedMemory(ORU::MemoryType type, void *p) noexcept;

/// Whether `size` bytes at `p` may be touched: always true. Nothing here asks; it has its place in
/// the binary interface.
ORU_API bool CheckMemoryLegal(void const *p, std::size_t size);

} // namespace ORU_private

namespace ORU {

/// Whether `p` is a multiple of `alignment`.
inline bool IsAligned(void const *p, int alignment) {
    return reinterpret_cast<std::uintptr_t>(p) % static_cast<std::uintptr_t>(alignment) == 0;
}

/// Deleter of smart pointers to aligned image buffers.
struct ORUImageAlignedDeleter {
    /// Frees what `NewAlignedMemory` returned for `MEMORYTYPE_IMAGE`; null is ignored.
    void operator()(void *p) const noexcept {
        ORU_private::DeleteAlignedMemory(MEMORYTYPE_IMAGE, p);
    }
};

} // namespace ORU
