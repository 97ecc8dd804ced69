// Memory hooks that count what passes through them.
#pragma once

#include "oru/core/memory/orumemory.h"

#include <cstdlib>
#include <map>
#include <new>
#include <string>

namespace oru_test {

/// Installs hooks for its lifetime: everything allocated meanwhile must be freed meanwhile.
class CountingHooks {
public:
    struct Allocation {
        std::size_t size;
        ORU::MemoryType type;
        std::string file;
        int line;
    };

    CountingHooks() {
        sCurrent_ = this;
        ORU::SetAllocationDeallocationFunction(Allocate, Free);
    }
    ~CountingHooks() {
        ORU_private::gAllocationFunction = nullptr;
        ORU_private::gDeallocationFunction = nullptr;
        sCurrent_ = nullptr;
    }
    CountingHooks(CountingHooks const &) = delete;
    CountingHooks &operator=(CountingHooks const &) = delete;

    int allocations() const { return allocations_; }
    /// The allocation that runs out of memory, counted from 1.
    void failAt(int allocation) { failAt_ = allocation; }
    /// What is not freed yet, by address.
    std::map<void *, Allocation> const &outstanding() const { return outstanding_; }
    /// Releases of what was not allocated here, or under another type.
    int wrongReleases() const { return wrongReleases_; }

private:
    inline static CountingHooks *sCurrent_ = nullptr;

    static void *Allocate(std::size_t size, ORU::MemoryType type, char const *file, int line) {
        if (++sCurrent_->allocations_ == sCurrent_->failAt_)
            throw std::bad_alloc();
        void *const p = std::malloc(size);
        sCurrent_->outstanding_[p] = Allocation{size, type, file, line};
        return p;
    }

    static void Free(void *p, ORU::MemoryType type, char const *, int) {
        auto &outstanding = sCurrent_->outstanding_;
        auto const found = outstanding.find(p);
        if (found == outstanding.end() || found->second.type != type) {
            ++sCurrent_->wrongReleases_;
            return;
        }
        outstanding.erase(found);
        std::free(p);
    }

    int allocations_ = 0;
    int failAt_ = 0;
    int wrongReleases_ = 0;
    std::map<void *, Allocation> outstanding_;
};

} // namespace oru_test
