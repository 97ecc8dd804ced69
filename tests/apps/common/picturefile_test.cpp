// Pictures that are read and written row by row, with their history.
#include "apps/common/picturefile.h"

#include "apps/common/failure.h"
#include "apps/common/file.h"
#include "apps/common/history.h"
#include "tests/apps/common/picturebytes.h"
#include "tests/support/failure.h"

#include <gmock/gmock.h>

#include <cmath>

using namespace apps_test;
using App::FileKind;
using App::Image;
using App::PictureHead;

namespace {

constexpr FileKind kKinds[] = {FileKind::Png, FileKind::Jpeg, FileKind::Tiff};

bool Holds(FileKind kind, App::Shape const &shape) {
    return kind == FileKind::Tiff || (kind == FileKind::Png && shape.bitsPerChannel < 32) ||
           (kind == FileKind::Jpeg && shape.bitsPerChannel == 8 && !shape.hasAlpha());
}

/// A file of a picture that is stored in another way than it is to be looked at.
Bytes Held(PictureHead head, Bytes const &pixels, unsigned char orientation) {
    head.metadata.exif = ExifOf(orientation);
    Bytes file = Encoded(head, pixels);
    if (head.kind == FileKind::Tiff)
        SetShort(file, 274, orientation);
    return file;
}

/// Where a pixel of the picture as it is stored comes to lie, for each way to hold a camera.
std::pair<std::size_t, std::size_t> Place(App::Shape const &stored, unsigned int orientation,
                                          std::size_t x, std::size_t y) {
    std::size_t const right = stored.width - 1, bottom = stored.height - 1;
    std::pair<std::size_t, std::size_t> const places[] = {
        {x, y}, {right - x, y},  {right - x, bottom - y}, {x, bottom - y},
        {y, x}, {bottom - y, x}, {bottom - y, right - x}, {y, right - x}};
    return places[orientation - 1];
}

Image Upright(Image const &stored, unsigned int orientation) {
    App::Shape shape = stored;
    if (orientation >= 5)
        std::swap(shape.width, shape.height);
    Image upright(shape);
    for (std::size_t y = 0; y < stored.height; ++y)
        for (std::size_t x = 0; x < stored.width; ++x) {
            auto const [column, row] = Place(stored, orientation, x, y);
            std::copy_n(stored.row(y) + x * shape.bytesPerPixel(), shape.bytesPerPixel(),
                        upright.row(row) + column * shape.bytesPerPixel());
        }
    return upright;
}

/// Reads in portions of growing size.
Image Streamed(App::PictureReader &reader) {
    Image image(reader.head());
    for (std::size_t y = 0, count = 1; y < image.height; y += count, count = count % 4 + 1) {
        count = std::min(count, image.height - y);
        reader.read(image.row(y), count);
    }
    return image;
}

// Every kind of file, depth and number of channels, held in every way, gives the rows of the
// upright picture.
TEST(PictureFile, EveryKindHeldInEveryWay) {
    for (FileKind const kind : kKinds)
        for (unsigned int bits : {8u, 16u, 32u})
            for (unsigned int channels = 1; channels <= 4; ++channels) {
                App::Shape const shape = {13, 7, channels, bits};
                PictureHead const head = HeadOf(kind, shape);
                Image stored = RandomPicture(shape, channels + bits);
                if (!Holds(kind, shape)) {
                    EXPECT_THROW(Encoded(head, stored.pixels), App::Failure) << shape.description();
                    continue;
                }
                if (kind == FileKind::Jpeg) // what it makes of the picture is not looked at here
                    stored = Streamed(*Opened(Encoded(head, stored.pixels)));
                for (unsigned char orientation = 1; orientation <= 8; ++orientation) {
                    Bytes const &pixels = RandomPicture(shape, channels + bits).pixels;
                    auto const reader = Opened(Held(head, pixels, orientation));
                    Image const expected = Upright(stored, orientation);
                    ASSERT_TRUE(reader->head() == static_cast<App::Shape const &>(expected));
                    EXPECT_EQ(Streamed(*reader).pixels, expected.pixels)
                        << shape.description() << " kind " << static_cast<int>(kind)
                        << " orientation " << int{orientation};
                }
            }
}

// What is too large to be put aside in memory.
TEST(PictureFile, LargeHeldInEveryWay) {
    PictureHead const head = HeadOf(FileKind::Tiff, {4500, 2003, 4, 8});
    Image stored(head);
    for (std::size_t i = 0; i < stored.pixels.size(); ++i)
        stored.pixels[i] = static_cast<unsigned char>(i / 1000);
    for (unsigned char const orientation : std::initializer_list<unsigned char>{3, 7})
        EXPECT_TRUE(Streamed(*Opened(Held(head, stored.pixels, orientation))).pixels ==
                    Upright(stored, orientation).pixels);
}

// Which lies on its side with the picture.
TEST(PictureFile, JpegsKeepTheirSampling) {
    PictureHead head = HeadOf(FileKind::Jpeg, {40, 24, 3, 8});
    head.metadata.exif = ExifOf(6);
    Image const image = RandomPicture(head, 1);
    for (auto const &[horizontal, vertical] : {std::pair(1, 1), {2, 1}, {1, 2}, {2, 2}, {4, 1}}) {
        Bytes file;
        App::Encoding encoding;
        encoding.kind = FileKind::Jpeg;
        encoding.sampling = {horizontal, vertical};
        auto const writer =
            App::CreatePicture(std::make_unique<App::MemorySink>(file), head, encoding);
        writer->write(image.pixels.data(), image.height);
        writer->finish();
        auto const sampling = Opened(file)->head().sampling;
        ASSERT_TRUE(sampling.has_value());
        EXPECT_EQ(std::pair(sampling->horizontal, sampling->vertical),
                  std::pair(vertical, horizontal));
    }
}

/// What Exif data tell beside the resolution, whatever file they came from.
Bytes Told(Bytes const &exif) {
    std::vector<std::string> ignored;
    App::TiffTree tree = App::TiffOfExif(exif, false, ignored);
    auto const isResolution = [](App::TiffEntry const &entry) {
        return entry.tag == 282 || entry.tag == 283 || entry.tag == 296;
    };
    tree.entries.erase(std::remove_if(tree.entries.begin(), tree.entries.end(), isResolution),
                       tree.entries.end());
    return App::EncodeTiffTree(tree, 0, {});
}

// From each kind of file into each other goes all that both can hold, and nothing stale.
TEST(PictureFile, HistoryGoesFromFileToFile) {
    Bytes const pixels(13 * 7 * 3);
    for (FileKind const from : kKinds)
        for (FileKind const to : kKinds) {
            PictureHead head = HeadOf(from, {13, 7, 3, 8});
            GiveHistory(head, 70000); // more than a segment of JPEG's holds
            head.metadata.resolution->y = 150;
            PictureHead first = Opened(Held(head, pixels, 6))->head();
            first.kind = to;
            std::vector<std::string> losses;
            Bytes const file = Encoded(first, pixels, &losses);
            PictureHead const second = Opened(file)->head();

            bool const isIptcLost = from == FileKind::Png || to == FileKind::Png;
            SCOPED_TRACE(std::to_string(static_cast<int>(from)) + " to " +
                         std::to_string(static_cast<int>(to)));
            EXPECT_EQ(second.colour.profile, head.colour.profile);
            EXPECT_EQ(second.metadata.iptc, isIptcLost ? Bytes() : head.metadata.iptc);
            EXPECT_EQ(!losses.empty(), to == FileKind::Png && from != FileKind::Png);
            std::string const xmp(second.metadata.xmp.begin(), second.metadata.xmp.end());
            EXPECT_EQ(xmp, "<x tiff:Orientation=\"1\"><exif:PixelXDimension>7</exif:"
                           "PixelXDimension></x>");

            PictureHead upright = HeadOf(FileKind::Png, {7, 13, 3, 8});
            upright.colour.profile.resize(1);
            upright.colour.isNamedSrgb = true;
            upright.metadata.exif = ExifOf(1);
            EXPECT_EQ(Told(second.metadata.exif), Told(App::HistoryOf(upright).exif));
            EXPECT_TRUE(second.colour.isNamedSrgb);
            std::string const bytes(file.begin(), file.end());
            EXPECT_EQ(bytes.find("THUM"), std::string::npos);
            EXPECT_EQ(App::TakeHistory(second.metadata.exif, {}, upright), App::kUpright);

            auto const &resolution = second.metadata.resolution;
            ASSERT_TRUE(resolution.has_value());
            bool const isInch = resolution->unit == App::Resolution::Unit::Inch;
            EXPECT_NEAR(resolution->x * (isInch ? 1 : 2.54), 150, 0.02); // lies on its side
            EXPECT_NEAR(resolution->y * (isInch ? 1 : 2.54), 300, 0.02);
        }
}

bool Contains(Bytes const &bytes, std::string const &text) {
    return std::search(bytes.begin(), bytes.end(), text.begin(), text.end()) != bytes.end();
}

// What another program wrote is understood.
TEST(PictureFile, ForeignHistory) {
    for (std::string const name : {"history.jpg", "history.png", "history.tif"}) {
        SCOPED_TRACE(name);
        PictureHead const head = Opened(Foreign(name))->head();
        App::Metadata const &history = head.metadata;
        EXPECT_EQ(head.width, 17u);
        EXPECT_THAT(history.losses, testing::IsEmpty());
        EXPECT_EQ(head.colour.profile.size(), 132u);
        EXPECT_TRUE(head.colour.isNamedSrgb);
        EXPECT_TRUE(Contains(history.exif, "ORU"));
        EXPECT_FALSE(Contains(history.exif, "\xFF\xD8\xFF"));
        EXPECT_TRUE(Contains(history.xmp, "Leaf"));
        EXPECT_TRUE(Contains(history.xmp, "<tiff:Orientation>1<"));
        EXPECT_EQ(Contains(history.iptc, "Ulm"), head.kind != FileKind::Png);
        ASSERT_TRUE(history.resolution.has_value());
        bool const isInch = history.resolution->unit == App::Resolution::Unit::Inch;
        EXPECT_NEAR(history.resolution->x * (isInch ? 1 : 2.54), 150, 0.02);
    }
}

// Gamma and primaries are PNG's; JPEG says that it does not hold them. Exif data know sRGB only.
TEST(PictureFile, ColourTags) {
    PictureHead head = HeadOf(FileKind::Png, {13, 7, 3, 8});
    head.colour.gamma = 1.8;
    head.colour.primaries =
        App::Primaries{{{0.3127, 0.329}, {0.68, 0.32}, {0.265, 0.69}, {0.15, 0.06}}};
    Bytes const pixels(13 * 7 * 3);
    App::ColourTags const read = Opened(Encoded(head, pixels))->head().colour;
    EXPECT_NEAR(read.gamma.value_or(0), 1.8, 1e-4);
    ASSERT_TRUE(read.primaries.has_value());
    for (std::size_t i = 0; i < 8; ++i)
        EXPECT_NEAR((*read.primaries)[i / 2][i % 2], (*head.colour.primaries)[i / 2][i % 2], 1e-5);
    head.kind = FileKind::Jpeg;
    std::vector<std::string> losses;
    Encoded(head, pixels, &losses);
    EXPECT_THAT(losses,
                testing::ElementsAre("JPEG holds no gamma and primaries without a colour profile"));
    head.kind = FileKind::Png;
    head.colour = {};
    head.colour.isNamedSrgb = true;
    EXPECT_TRUE(Opened(Encoded(head, pixels))->head().colour.isNamedSrgb);
    head.colour.isNamedSrgb = false;
    head.colour.profile.resize(1);
    head.metadata.exif = ExifOf(1);
    EXPECT_FALSE(Opened(Encoded(head, pixels))->head().colour.isNamedSrgb);
}

// Damaged Exif data are dropped, which is told, and never do harm.
TEST(PictureFile, DamagedExif) {
    for (std::size_t i = 0; i < 2 * ExifOf(1).size(); ++i) {
        PictureHead head = HeadOf(FileKind::Png, {3, 2, 3, 8});
        Bytes exif = ExifOf(1);
        if (i < exif.size())
            exif[i] = static_cast<unsigned char>(~exif[i]);
        else
            exif.resize(i - exif.size() + 1);
        Bytes const before = exif;
        App::Orientation const orientation = App::TakeHistory(exif, {}, head);
        EXPECT_TRUE(orientation >= 1 && orientation <= 8);
        EXPECT_EQ(head.metadata.exif.empty(), !head.metadata.losses.empty());
        App::Metadata const history = App::HistoryOf(head);
        EXPECT_LE(history.exif.size(), before.size());
        bool const isDirectoryCut = exif.size() < 88;
        EXPECT_TRUE(head.metadata.exif.empty() || !isDirectoryCut) << i;
    }
}

// What is not completed leaves nothing behind, and what stood there stays.
TEST(PictureFile, UnfinishedFilesGo) {
    TemporaryFolder const folder;
    std::filesystem::create_directory(folder.path() / "folder");
    Bytes const before = {1, 2, 3}, pixels(4000 * 3);
    App::WriteFile(folder.path() / "old", before);
    PictureHead const head = HeadOf(FileKind::Png, {2000, 2, 3, 8});
    for (FileKind const kind : kKinds) {
        App::Encoding encoding;
        encoding.kind = kind;
        App::CreatePicture(folder.path() / "old", head, encoding)->write(pixels.data(), 1);
        auto const writer = App::CreatePicture(folder.path() / "folder", head, encoding);
        writer->write(pixels.data(), 2);
        EXPECT_FAILURE("cannot be written: there is a folder of this name", writer->finish());
    }
    EXPECT_THAT(folder.list(""), testing::ElementsAre("folder", "old"));
    EXPECT_EQ(App::ReadText(folder.path() / "old"), "\1\2\3");
}

} // namespace
