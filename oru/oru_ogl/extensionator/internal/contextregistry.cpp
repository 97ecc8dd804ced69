// Which capability record belongs to which rendering context.
#include "oru/oru_ogl/extensionator/internal/contextregistry.h"

#include <tbb/concurrent_hash_map.h>
#include <tbb/spin_mutex.h>

#include <atomic>
#include <cstddef>
#include <cstdint>

namespace ORU {
namespace OGL {
namespace internal {
namespace ContextRegistry {

namespace {

using Map = tbb::concurrent_hash_map<HGLRC, ExtensionManager *>;

/// The index: open addressing with a short fixed probe. An entry is written record first and
/// erased context first, so a reader that finds its context finds that context's record; it could
/// see another's only if its context were unregistered while it is current, which is not allowed.
/// A context that finds no room is simply answered by the map.
struct Slot {
    std::atomic<HGLRC> context{nullptr};
    std::atomic<ExtensionManager *> record{nullptr};
};

std::size_t const kSlotBits = 8;
std::size_t const kSlots = std::size_t(1) << kSlotBits;
std::size_t const kProbes = 8;

/// Slots beyond kSlots let a probe run on without wrapping around.
Slot gIndex[kSlots + kProbes];
tbb::spin_mutex gIndexWriter;

Map &TheMap() {
    static auto &map = *new Map; // never destroyed, as threads may still ask at process exit
    return map;
}

Slot *FirstSlot(HGLRC context) {
    // Fibonacci hashing: handles differ in a few low or middle bits only.
    auto const mixed =
        reinterpret_cast<std::uintptr_t>(context) * std::uintptr_t(0x9E3779B97F4A7C15);
    return gIndex + (mixed >> (64 - kSlotBits));
}

Slot *FindSlot(HGLRC context) {
    Slot *const first = FirstSlot(context);
    for (Slot *slot = first; slot != first + kProbes; ++slot)
        if (slot->context.load(std::memory_order_acquire) == context)
            return slot;
    return nullptr;
}

} // namespace

ExtensionManager *Find(HGLRC context) {
    if (context)
        if (Slot const *slot = FindSlot(context))
            return slot->record.load(std::memory_order_relaxed);
    Map::const_accessor entry;
    return TheMap().find(entry, context) ? entry->second : nullptr;
}

void Insert(HGLRC context, ExtensionManager *record) {
    tbb::spin_mutex::scoped_lock lock(gIndexWriter);
    if (!TheMap().insert(Map::value_type(context, record)) || !context)
        return;
    Slot *const first = FirstSlot(context);
    for (Slot *slot = first; slot != first + kProbes; ++slot) {
        if (slot->context.load(std::memory_order_relaxed))
            continue;
        slot->record.store(record, std::memory_order_relaxed);
        slot->context.store(context, std::memory_order_release);
        return;
    }
}

bool Erase(HGLRC context) {
    tbb::spin_mutex::scoped_lock lock(gIndexWriter);
    if (context)
        if (Slot *slot = FindSlot(context))
            slot->context.store(nullptr, std::memory_order_release);
    return TheMap().erase(context);
}

void Clear() {
    tbb::spin_mutex::scoped_lock lock(gIndexWriter);
    for (Slot &slot : gIndex)
        slot.context.store(nullptr, std::memory_order_release);
    TheMap().clear();
}

} // namespace ContextRegistry
} // namespace internal
} // namespace OGL
} // namespace ORU
