// Picture files, read and written whole.
#include "apps/common/imagefile.h"

#include "apps/common/picturefile.h"
#include "apps/common/sink.h"
#include "apps/common/source.h"

namespace App {

namespace {

Image ReadWhole(PictureReader &reader, SizeLimit limit) {
    limit.require(reader.head().width, reader.head().height);
    Image image(reader.head());
    reader.read(image.pixels.data(), image.height);
    return image;
}

void WriteWhole(PictureWriter &writer, Image const &image) {
    writer.write(image.pixels.data(), image.height);
    writer.finish();
}

PictureHead HeadOf(Image const &image) {
    PictureHead head;
    static_cast<Shape &>(head) = image;
    return head;
}

} // namespace

Image ReadImage(std::filesystem::path const &path, SizeLimit limit) {
    return ReadWhole(*OpenPicture(path), limit);
}

void WriteImage(std::filesystem::path const &path, Image const &image) {
    WriteWhole(*CreatePicture(path, HeadOf(image), Encoding()), image);
}

Image Decode(std::vector<unsigned char> const &bytes, SizeLimit limit) {
    return ReadWhole(*OpenPicture(std::make_unique<MemorySource>(bytes)), limit);
}

std::vector<unsigned char> EncodePng(Image const &image) {
    Bytes bytes;
    WriteWhole(*CreatePicture(std::make_unique<MemorySink>(bytes), HeadOf(image), Encoding()),
               image);
    return bytes;
}

} // namespace App
