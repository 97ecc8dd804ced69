// Which capability record belongs to which rendering context.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/windowsforward.h"

#include <atomic>
#include <cstddef>
#include <cstdint>

namespace ORU::OGL {

class ExtensionManager;
struct FunctionTable;

namespace internal {

/// The process-wide map from rendering contexts to the records of their implementation, which it
/// does not own. Any thread may look up, insert and erase at any time. What a context itself is,
/// not its implementation, stands beside the record, which contexts of different profiles share.
///
/// A look-up stands before every OpenGL call beyond 1.1, so it must not write anything that threads
/// share, which the concurrent map's element locks do. A small read-only index answers for the
/// contexts in use; only what it does not hold goes to the map.
class ContextRegistry {
public:
    /// What is known of a context: Core is one without what OpenGL 3 deprecated.
    enum class Profile : unsigned char { Unknown, Compatibility, Core };

    /// The context's record, or null.
    static ExtensionManager *Find(HGLRC context);

    /// @name At once
    /// The record, or its function table, when the index has the context at its first place, which
    /// is where it is but for a collision of two contexts in use; else null.
    /// @{
    static ExtensionManager *FindAtOnce(HGLRC context) {
        Slot const &slot = sIndex_[Hash(context)];
        return ORU_LIKELY(Holds(slot, context)) ? slot.record.load(std::memory_order_relaxed)
                                                : nullptr;
    }
    static FunctionTable const *FindTable(HGLRC context) {
        Slot const &slot = sIndex_[Hash(context)];
        return ORU_LIKELY(Holds(slot, context)) ? slot.table.load(std::memory_order_relaxed)
                                                : nullptr;
    }
    /// @}

    /// Adds an entry; one already present for the context stays.
    /// @param table the record's function table
    static void Insert(HGLRC context, ExtensionManager *record, FunctionTable const *table);

    /// Removes an entry.
    /// @return whether there was one
    static bool Erase(HGLRC context);

    static void Clear();

    /// @name Profiles
    /// Kept while a context of the library holds the rendering context, which it made or adopted.
    /// The host does not say when it deletes another one, whose handle may then be that of a new
    /// context with another profile.
    /// @{
    static Profile FindProfile(HGLRC context);
    static void KeepProfile(HGLRC context, Profile profile);
    static void Hold(HGLRC context);
    static void LetGo(HGLRC context);
    /// @}

private:
    /// No context has this handle; null will not do, as a thread without a context asks for it.
    static std::uintptr_t const kFree = ~std::uintptr_t(0);

    /// A place of the index. It is written record and table first and erased context first, so a
    /// reader that finds its context finds that context's record; it could see another's only if
    /// its context were unregistered while it is current, which is not allowed.
    struct alignas(32) Slot {
        std::atomic<std::uintptr_t> context{kFree};
        std::atomic<FunctionTable const *> table{nullptr};
        std::atomic<ExtensionManager *> record{nullptr};
        std::atomic<unsigned short> holders{0};
        std::atomic<Profile> profile{Profile::Unknown};
    };
    static_assert(sizeof(Slot) == 32, "Two places lie in each line of the cache.");

    static std::size_t const kSlotBits = 8;
    static std::size_t const kSlots = std::size_t(1) << kSlotBits;
    static std::size_t const kProbes = 8;

    static std::uintptr_t Key(HGLRC context) { return reinterpret_cast<std::uintptr_t>(context); }

    /// Fibonacci hashing: handles differ in a few low or middle bits only.
    static std::size_t Hash(HGLRC context) {
        return (Key(context) * std::uintptr_t(0x9E3779B97F4A7C15)) >> (64 - kSlotBits);
    }

    static bool Holds(Slot const &slot, HGLRC context) {
        return slot.context.load(std::memory_order_acquire) == Key(context);
    }

    static Slot *FindSlot(HGLRC context);

    /// Open addressing with a short probe, for which there are places beyond the last; a context
    /// that finds no room is answered by the map alone.
    static Slot sIndex_[kSlots + kProbes];
};

} // namespace internal
} // namespace ORU::OGL
