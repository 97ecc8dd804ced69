// PNG pictures, with all that their chunks hold.
#include "fuzz/picture.h"

#include "apps/common/pngreader.h"

#include <zlib.h>

namespace {

std::size_t BigEndian32(std::uint8_t const *bytes) {
    return std::size_t{bytes[0]} << 24 | std::size_t{bytes[1]} << 16 | std::size_t{bytes[2]} << 8 |
           std::size_t{bytes[3]};
}

/// Makes the checksums of all chunks right, without which nothing behind them would be reached.
void SetChecksums(std::uint8_t *data, std::size_t size) {
    constexpr std::size_t kAround = 12; // length, name and checksum of a chunk
    constexpr std::size_t kSignatureBytes = 8;
    for (std::size_t chunk = kSignatureBytes; chunk + kAround <= size;) {
        std::size_t const length = BigEndian32(data + chunk);
        if (length > size - chunk - kAround)
            return;
        auto const sum = ::crc32(0, data + chunk + 4, static_cast<unsigned int>(length + 4));
        for (std::size_t i = 0; i < 4; ++i)
            data[chunk + 8 + length + i] = static_cast<std::uint8_t>(sum >> (24 - 8 * i));
        chunk += kAround + length;
    }
}

} // namespace

extern "C" std::size_t LLVMFuzzerMutate(std::uint8_t *data, std::size_t size, std::size_t room);

/// Replaces libFuzzer's mutation of inputs: most of the results are given their checksums.
extern "C" std::size_t LLVMFuzzerCustomMutator(std::uint8_t *data, std::size_t size,
                                               std::size_t room, unsigned int seed) {
    size = LLVMFuzzerMutate(data, size, room);
    if (seed % 8 != 0)
        SetChecksums(data, size);
    return size;
}

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    if (!App::IsPng(App::Bytes(data, data + size)))
        return -1; // is not kept
    fuzz::Check(data, size);
    return 0;
}
