// TIFF pictures, with all that their fields hold.
#include "fuzz/picture.h"

#include "apps/common/tiffreader.h"

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    if (!App::IsTiff(App::Bytes(data, data + size)))
        return -1; // is not kept
    fuzz::Check(data, size);
    return 0;
}
