// Counts what a program allocates with the plain operator new.
#pragma once

namespace oru_test {

/// Allocations of the calling thread, as the system runs threads of its own.
long AllocationCount();

} // namespace oru_test
