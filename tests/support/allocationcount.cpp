// Counts what a program allocates with the plain operator new.
#include "tests/support/allocationcount.h"

#include <cstdlib>
#include <new>

namespace {

thread_local long gCount = 0;

} // namespace

long oru_test::AllocationCount() {
    return gCount;
}

void *operator new(std::size_t size) {
    ++gCount;
    if (void *memory = std::malloc(size ? size : 1))
        return memory;
    throw std::bad_alloc();
}

void operator delete(void *memory) noexcept {
    std::free(memory);
}

void operator delete(void *memory, std::size_t) noexcept {
    std::free(memory);
}
