// Aligned image memory through the hooks, and its deleter.
#include "oru/core/memory/orumemoryprivate.h"

#include "oru/core/exceptions/checks.h"

#include <cstring>

namespace ORU_private {

namespace {

// The block's layout is a contract with hosts: the raw address fills the 8 bytes below the result.
constexpr std::size_t kRawAddressSize = 8;
static_assert(sizeof(void *) == kRawAddressSize, "the raw address fills its slot");

ORU::MemoryType HookType(ORU::MemoryType type) {
    return type == ORU::MEMORYTYPE_IMAGE ? ORU::MEMORYTYPE_IMAGE : ORU::MEMORYTYPE_DEFAULT;
}

} // namespace

void *NewAlignedMemory(ORU::MemoryType type, std::size_t size, int alignment) {
    std::size_t const step = static_cast<std::size_t>(alignment);
    void *raw = operator new(size + kRawAddressSize + step, HookType(type), __FILE__, __LINE__);
    std::uintptr_t address = reinterpret_cast<std::uintptr_t>(raw) + kRawAddressSize;
    if (std::uintptr_t const rest = address % step)
        address += step - rest;
    void *const aligned = reinterpret_cast<void *>(address);
    // An alignment below 8 leaves the slot itself unaligned.
    std::memcpy(static_cast<char *>(aligned) - kRawAddressSize, &raw, kRawAddressSize);
    ORU_ASSERT_TEXT("ORU::IsAligned(resultP, alignment)", ORU::IsAligned(aligned, alignment));
    return aligned;
}

void DeleteAlignedMemory(ORU::MemoryType type, void *p) noexcept {
    if (!p)
        return;
    void *raw;
    std::memcpy(&raw, static_cast<char *>(p) - kRawAddressSize, kRawAddressSize);
    operator delete(raw, HookType(type), __FILE__, __LINE__);
}

bool CheckMemoryLegal(void const *, std::size_t) {
    return true;
}

} // namespace ORU_private
