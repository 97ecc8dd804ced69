// JPEG pictures, with all that their markers hold.
#include "fuzz/picture.h"

#include "apps/common/jpegreader.h"

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    if (!App::IsJpeg(App::Bytes(data, data + size)))
        return -1; // is not kept
    fuzz::Check(data, size);
    return 0;
}
