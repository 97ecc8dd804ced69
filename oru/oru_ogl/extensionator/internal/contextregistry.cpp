// Which capability record belongs to which rendering context.
#include "oru/oru_ogl/extensionator/internal/contextregistry.h"

#include <tbb/concurrent_hash_map.h>
#include <tbb/spin_mutex.h>

namespace ORU::OGL::internal {

namespace {

using Map = tbb::concurrent_hash_map<HGLRC, ExtensionManager *>;

Map &TheMap() {
    static auto &map = *new Map; // never destroyed, as threads may still ask at process exit
    return map;
}

/// Held while the index changes; readers take no lock.
tbb::spin_mutex gIndexWriter;

} // namespace

ContextRegistry::Slot ContextRegistry::sIndex_[kSlots + kProbes];

ContextRegistry::Slot *ContextRegistry::FindSlot(HGLRC context) {
    Slot *const first = sIndex_ + Hash(context);
    for (Slot *slot = first; slot != first + kProbes; ++slot)
        if (Holds(*slot, context))
            return slot;
    return nullptr;
}

ExtensionManager *ContextRegistry::Find(HGLRC context) {
    if (Slot const *slot = FindSlot(context))
        return slot->record.load(std::memory_order_relaxed);
    Map::const_accessor entry;
    return TheMap().find(entry, context) ? entry->second : nullptr;
}

void ContextRegistry::Insert(HGLRC context, ExtensionManager *record, FunctionTable const *table) {
    tbb::spin_mutex::scoped_lock lock(gIndexWriter);
    if (!TheMap().insert(Map::value_type(context, record)))
        return;
    Slot *const first = sIndex_ + Hash(context);
    for (Slot *slot = first; slot != first + kProbes; ++slot) {
        if (slot->context.load(std::memory_order_relaxed) != kFree)
            continue;
        slot->record.store(record, std::memory_order_relaxed);
        slot->table.store(table, std::memory_order_relaxed);
        slot->holders.store(0, std::memory_order_relaxed);
        slot->profile.store(Profile::Unknown, std::memory_order_relaxed);
        slot->context.store(Key(context), std::memory_order_release);
        return;
    }
}

bool ContextRegistry::Erase(HGLRC context) {
    tbb::spin_mutex::scoped_lock lock(gIndexWriter);
    if (Slot *slot = FindSlot(context))
        slot->context.store(kFree, std::memory_order_release);
    return TheMap().erase(context);
}

void ContextRegistry::Clear() {
    tbb::spin_mutex::scoped_lock lock(gIndexWriter);
    for (Slot &slot : sIndex_)
        slot.context.store(kFree, std::memory_order_release);
    TheMap().clear();
}

ContextRegistry::Profile ContextRegistry::FindProfile(HGLRC context) {
    Slot const *slot = FindSlot(context);
    return slot ? slot->profile.load(std::memory_order_relaxed) : Profile::Unknown;
}

void ContextRegistry::KeepProfile(HGLRC context, Profile profile) {
    Slot *slot = FindSlot(context);
    if (slot && slot->holders.load(std::memory_order_relaxed))
        slot->profile.store(profile, std::memory_order_relaxed);
}

void ContextRegistry::Hold(HGLRC context) {
    if (Slot *slot = FindSlot(context))
        slot->holders.fetch_add(1, std::memory_order_relaxed);
}

void ContextRegistry::LetGo(HGLRC context) {
    Slot *slot = FindSlot(context);
    if (slot && slot->holders.load(std::memory_order_relaxed) &&
        slot->holders.fetch_sub(1, std::memory_order_relaxed) == 1)
        slot->profile.store(Profile::Unknown, std::memory_order_relaxed);
}

} // namespace ORU::OGL::internal
