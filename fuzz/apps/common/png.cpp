// PNG pictures.
#include "fuzz/harness.h"

#include "apps/common/failure.h"
#include "apps/common/pngcodec.h"

#include <zlib.h>

#include <algorithm>

namespace {

using Bytes = std::vector<unsigned char>;

constexpr App::SizeLimit kLimit = {300};

std::size_t BigEndian32(std::uint8_t const *bytes) {
    return std::size_t{bytes[0]} << 24 | std::size_t{bytes[1]} << 16 | std::size_t{bytes[2]} << 8 |
           std::size_t{bytes[3]};
}

/// Makes the checksums of all chunks right, without which nothing behind them would be reached.
void SetChecksums(std::uint8_t *data, std::size_t size) {
    constexpr std::size_t kAround = 12; // length, name and checksum of a chunk
    for (std::size_t chunk = App::kPngSignatureBytes; chunk + kAround <= size;) {
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
    Bytes const file(data, data + size);
    if (!App::IsPng(file))
        return -1; // is not kept
    try {
        App::Image const image = App::DecodePng(file, kLimit);
        HOLDS(image.width > 0 && image.height > 0);
        HOLDS(image.width <= kLimit.side && image.height <= kLimit.side);
        HOLDS(image.pixels.size() == image.rowBytes() * image.height);
        App::Image const again = App::DecodePng(App::EncodePng(image), kLimit);
        HOLDS(again == static_cast<App::Shape const &>(image) && again.pixels == image.pixels);
    } catch (App::Failure const &failure) {
        HOLDS(std::string(failure.what()).find('\n') == std::string::npos);
    }
    return 0;
}
