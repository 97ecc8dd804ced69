// JPEG pictures, with the Exif data that tell how a camera was held.
#include "fuzz/harness.h"

#include "apps/common/failure.h"
#include "apps/common/jpegcodec.h"

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    constexpr App::SizeLimit kLimit = {300};
    std::vector<unsigned char> const file(data, data + size);
    if (!App::IsJpeg(file))
        return -1; // is not kept
    try {
        App::Image const image = App::DecodeJpeg(file, kLimit);
        HOLDS(image.width > 0 && image.height > 0);
        HOLDS(image.width <= kLimit.side && image.height <= kLimit.side);
        HOLDS(image.bitsPerChannel == 8 && (image.channels == 1 || image.channels == 3));
        HOLDS(image.pixels.size() == image.rowBytes() * image.height);
    } catch (App::Failure const &failure) {
        HOLDS(std::string(failure.what()).find('\n') == std::string::npos);
    }
    return 0;
}
