// The memory hooks, the owners that use them, and aligned memory.
#include "tests/support/countinghooks.h"
#include "tests/support/failure.h"

#include "oru/core/memory/orumemoryprivate.h"
#include "oru/core/utility/scopedptr.h"

#include <cstring>
#include <stdexcept>
#include <tuple>

using oru_test::CountingHooks;

namespace {

int gAlive = 0; ///< `Counted` objects that live

struct Counted {
    explicit Counted(bool fail = false) {
        if (fail)
            throw std::runtime_error("half way");
        ++gAlive;
    }
    Counted(Counted const &) = delete;
    Counted &operator=(Counted const &) = delete;
    virtual ~Counted() { --gAlive; }
};

/// Its `Counted` does not lie at its start, and another may fail when its bases already live.
struct First {
    virtual ~First() = default;
    int padding = 0;
};
struct Derived : First, Counted {
    explicit Derived(bool fail = false) : failing(fail) {}
    Counted failing;
};

/// Nothing is left, and nothing was freed in a wrong way.
void ExpectClean(CountingHooks const &hooks) {
    EXPECT_TRUE(hooks.outstanding().empty());
    EXPECT_EQ(hooks.wrongReleases(), 0);
    EXPECT_EQ(gAlive, 0);
}

TEST(MemoryHooks, SeeEachAllocationOnce) {
    CountingHooks hooks;
    void *const p = operator new(33, ORU::MEMORYTYPE_IMAGE, "some.cpp", 44);
    auto const &[size, type, file, line] = hooks.outstanding().at(p);
    EXPECT_EQ(std::tie(size, type, file, line),
              std::make_tuple(33u, ORU::MEMORYTYPE_IMAGE, "some.cpp", 44));
    operator delete(p, ORU::MEMORYTYPE_IMAGE, "other.cpp", 1);
    {
        ORU::ScopedPtr<Counted> const base(ORU::MakeScoped(ORU_NEW Derived));
        std::shared_ptr<Counted> const shared = ORU::MakeShared(ORU_NEW Derived);
        std::shared_ptr<Counted> const guest(base.get(), ORU::NullDeleter());
        EXPECT_EQ(hooks.outstanding().count(base.get()), 0u) << "it lies inside the object";
        EXPECT_EQ(gAlive, 4);
    }
    EXPECT_THROW(ORU::MakeScoped(ORU_NEW Derived(true)), std::runtime_error);
    EXPECT_EQ(hooks.allocations(), 4);
    ExpectClean(hooks);
}

TEST(MemoryHooks, AreInstalledOnce) {
    {
        CountingHooks hooks;
        EXPECT_FAILURE("ORU_private::gAllocationFunction == NULL",
                       ORU::SetAllocationDeallocationFunction(nullptr, nullptr));
    }
    auto const check = [](void const *, std::size_t) { return false; };
    ORU::SetMemoryCheckFunction(check);
    EXPECT_FAILURE("ORU_private::gMemoryCheckFunction == NULL", ORU::SetMemoryCheckFunction(check));
    EXPECT_TRUE(ORU_private::CheckMemoryLegal(nullptr, 0)) << "the hook is not asked";
    ORU_private::gMemoryCheckFunction = nullptr;
}

/// Allocates, checks the layout, fills every byte the caller may use, frees.
void UseAligned(ORU::MemoryType type, std::size_t size, int alignment, CountingHooks const *hooks) {
    void *const p = ORU_private::NewAlignedMemory(type, size, alignment);
    EXPECT_TRUE(ORU::IsAligned(p, alignment));
    if (hooks) {
        char *raw; // where the block begins stands before what the caller gets
        std::memcpy(&raw, static_cast<char *>(p) - sizeof raw, sizeof raw);
        auto const &seen = hooks->outstanding().at(raw);
        EXPECT_EQ(seen.size, size + sizeof raw + static_cast<std::size_t>(alignment));
        EXPECT_EQ(seen.type, type);
    }
    std::memset(p, 0xA5, size);
    ORU_private::DeleteAlignedMemory(type, p);
}

TEST(AlignedMemory, IsAlignedAndFreedWithAndWithoutHooks) {
    UseAligned(ORU::MEMORYTYPE_IMAGE, 100, 64, nullptr);
    CountingHooks hooks;
    for (auto const type : {ORU::MEMORYTYPE_DEFAULT, ORU::MEMORYTYPE_IMAGE})
        for (int const alignment : {1, 3, 8, 24, 4096})
            for (std::size_t const size : {0u, 100u, 65536u})
                UseAligned(type, size, alignment, &hooks);
    ExpectClean(hooks);
}

} // namespace
