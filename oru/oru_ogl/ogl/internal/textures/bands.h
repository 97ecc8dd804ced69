// Large transfers in parts that a processor's caches hold.
#pragma once

#include <algorithm>
#include <cstdint>

namespace ORU::OGL::internal {

/// Calls `each(first, count)` for bands of whole rows, or images, of about a mebibyte, the last
/// band first. A host writes a frame from its beginning to its end, and reads it so: what it wrote
/// last and what it reads first are in the caches then, which a frame as a whole runs through. A
/// driver that copies with the processor gains a tenth of its time; for others the calls are few.
/// Bands begin at multiples of 4, as compressed textures take rows in blocks.
/// @param units rows or images, at least 1
/// @param unitBytes from one to the next
template<class Each>
void ForEachBand(std::uint64_t units, std::uint64_t unitBytes, Each each) {
    constexpr std::uint64_t kBandBytes = std::uint64_t(1) << 20;
    std::uint64_t const most = std::max<std::uint64_t>(kBandBytes / unitBytes / 4, 1) * 4;
    for (std::uint64_t end = units; end > 0;) {
        std::uint64_t const first = (end - 1) / most * most;
        each(first, end - first);
        end = first;
    }
}

} // namespace ORU::OGL::internal
