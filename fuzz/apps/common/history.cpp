// Exif data and XMP by themselves: cleaned, brought up to date, and taken into a TIFF and back.
#include "fuzz/harness.h"

#include "apps/common/failure.h"
#include "apps/common/history.h"

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    App::Bytes const bytes(data, data + size);
    App::PictureHead head;
    head.width = 1000;
    head.height = 70000;
    head.colour.profile.resize(size % 2);
    App::Orientation const orientation = App::TakeHistory(bytes, bytes, head);
    HOLDS(orientation >= 1 && orientation <= 8);
    HOLDS(size == 0 || head.metadata.exif.empty() != head.metadata.losses.empty());
    App::Metadata const history = App::HistoryOf(head);
    App::PictureHead again;
    HOLDS(App::TakeHistory(head.metadata.exif, history.xmp, again) == App::kUpright);
    HOLDS(again.metadata.xmp == history.xmp);
    try {
        std::vector<std::string> losses;
        App::TiffTree const tree = App::TiffOfExif(history.exif, size % 3 == 0, losses);
        App::EncodeTiffTree(tree, 8, {size % 3 == 0, size % 5 == 0});
    } catch (App::Failure const &) {
    }
    return 0;
}
