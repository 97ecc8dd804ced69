// Counts what a program allocates with the plain operator new.
#pragma once

namespace oru_test {

/// Allocations since the program started.
long AllocationCount();

} // namespace oru_test
