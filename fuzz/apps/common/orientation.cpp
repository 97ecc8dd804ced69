// Exif data by themselves, and turning a picture upright by them.
#include "fuzz/harness.h"

#include "apps/common/orientation.h"

#include <algorithm>
#include <numeric>

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    App::Orientation const orientation = App::ReadOrientation(data, size);
    HOLDS(orientation >= 1 && orientation <= 8);
    std::string exif = fuzz::Text(data, size);
    exif.insert(0, "Exif\0\0", 6);
    App::Orientation const found =
        App::ReadOrientation(reinterpret_cast<unsigned char const *>(exif.data()), exif.size());
    HOLDS(found >= 1 && found <= 8);

    App::Image image({1 + size % 5, 1 + size % 7, 1 + static_cast<unsigned int>(size % 4), 8});
    std::iota(image.pixels.begin(), image.pixels.end(), static_cast<unsigned char>(0));
    App::Image upright = App::Upright(image, found);
    bool const isTurned = found >= 5;
    HOLDS(upright.width == (isTurned ? image.height : image.width) &&
          upright.channels == image.channels);
    std::sort(upright.pixels.begin(), upright.pixels.end());
    HOLDS(upright.pixels == image.pixels);
    return 0;
}
