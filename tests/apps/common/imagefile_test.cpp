// Reading pictures of all kinds, and what is none.
#include "apps/common/imagefile.h"

#include "apps/common/failure.h"
#include "apps/common/unicode.h"
#include "tests/apps/common/picturebytes.h"
#include "tests/support/failure.h"

#include <algorithm>
#include <iterator>

using namespace apps_test;
using App::Decode;
using App::FileKind;
using App::Image;

namespace {

// Names beyond the system's code page.
TEST(ImageFile, FilesOfAnyName) {
    TemporaryFolder const folder;
    std::filesystem::path const path = folder.path() / App::ToPath("Öl, 写真 ☀.png");
    Image const image = RandomPicture({13, 5, 3, 16}, 1);
    App::WriteImage(path, image);
    EXPECT_EQ(App::ReadImage(path).pixels, image.pixels);
    EXPECT_FAILURE("13 x 5 pixels are more than the GPU takes (12 x 12)",
                   App::ReadImage(path, {12}));
}

// Palettes, colour keys, few bits and interlacing become plain pixels.
TEST(ImageFile, ForeignPngs) {
    std::tuple<std::string, App::Shape, Bytes> const rows[] = {
        {"1bit.png", {5, 2, 1, 8}, {0, 255, 0, 255, 0, 255, 255, 0, 0, 255}},
        {"colourkey.png", {4, 1, 2, 8}, {0, 255, 85, 0, 170, 255, 255, 255}},
        {"palette-transparent.png", {3, 1, 4, 8}, {255, 0, 0, 255, 0, 200, 0, 128, 0, 0, 100, 0}},
    };
    for (auto const &[name, shape, values] : rows) {
        Image const image = Decode(Foreign(name));
        EXPECT_TRUE(image == shape) << name << ": " << image.description();
        EXPECT_EQ(image.pixels, values) << name;
    }
    Image const interlaced = Decode(Foreign("interlaced.png"));
    for (std::size_t i = 0; i < 25; ++i)
        EXPECT_EQ(interlaced.pixels.at(i), 10 * i);
}

TEST(ImageFile, Jpegs) {
    for (std::string const name : {"grey", "colour"}) {
        Image const original = Decode(Foreign(name + ".png"));
        EXPECT_LE(WorstError(original, Decode(Foreign(name + ".jpg")), 0.0), 6) << name;
    }
    EXPECT_FAILURE("a JPEG in CMYK, which is not supported; convert it to RGB first",
                   Decode(Foreign("cmyk.jpg")));
}

// Tiles, BigTIFF, either byte order, methods of compression and meanings of 0 come out alike.
TEST(ImageFile, ForeignTiffs) {
    Image const colour = Decode(Foreign("colour.png"));
    EXPECT_EQ(Decode(Foreign("tiles.tif")).pixels, colour.pixels);
    EXPECT_EQ(Decode(Foreign("white.tif")).pixels, Decode(Foreign("grey.png")).pixels);
    EXPECT_LE(WorstError(colour, Decode(Foreign("ycbcr.tif")), 0.0), 12);
    Image const wide = Decode(Foreign("big16.tif"));
    ASSERT_EQ(wide.pixels.size(), 2 * colour.pixels.size());
    for (std::size_t i = 0; i < colour.pixels.size(); ++i)
        ASSERT_EQ(Value(wide, i), 257u * colour.pixels[i]);
    // What is transparent has no colour then.
    EXPECT_EQ(Decode(Foreign("assoc.tif")).pixels,
              Bytes({255, 0, 0, 255, 0, 199, 0, 128, 0, 0, 0, 0}));
}

// What is sound but of a kind that is not read is not called damaged.
TEST(ImageFile, OtherKinds) {
    constexpr unsigned char kBaseline[] = {0xFF, 0xC0, 0, 17, 8}; // a frame, its length, bits
    std::pair<std::ptrdiff_t, unsigned char> const jpegs[] = {{1, 0xC3 /* lossless */}, {4, 12}};
    for (auto const &[at, value] : jpegs) {
        Bytes jpeg = Foreign("colour.jpg");
        auto const frame =
            std::search(jpeg.begin(), jpeg.end(), std::begin(kBaseline), std::end(kBaseline));
        ASSERT_NE(frame, jpeg.end());
        frame[at] = value;
        EXPECT_EQ(0u, oru_test::MessageOf([&] {
                          Decode(jpeg);
                      }).find("this kind of JPEG is not supported"))
            << int{value};
    }
    std::string const advice =
        ", which is not supported; convert it to grey or RGB of 8 or 16 bits first";
    EXPECT_FAILURE("a TIFF with a palette" + advice, Decode(Foreign("palette.tif")));
    struct Row {
        unsigned int channels, tag, value;
        char const *kind;
    };
    Row const tiffs[] = {
        {1, 262, 5, "in CMYK"},
        {3, 262, 6, "in YCbCr"},
        {1, 262, 32845, "in an unknown colour space"},
        {1, 258, 12, "of 12-bit integers"},
        {1, 339, 3, "of 16-bit floats"},
        {1, 259, 50000, "compressed by method 50000"},
        {1, 277, 3, "of 3 channels"},
        {3, 284, 2, "with each channel apart"},
    };
    for (Row const &row : tiffs) {
        App::PictureHead const head = HeadOf(FileKind::Tiff, {9, 4, row.channels, 16});
        Bytes tiff = Encoded(head, Bytes(head.rowBytes() * head.height));
        SetShort(tiff, row.tag, row.value);
        EXPECT_FAILURE("a TIFF " + std::string(row.kind) + advice, Decode(tiff));
    }
}

// Before memory is taken and before anything else is looked at.
TEST(ImageFile, TooShortForItsSize) {
    Bytes png = App::EncodePng(RandomPicture({9, 4, 3, 8}, 1));
    png[18] = png[22] = 0x0F; // 3849 by 3844 pixels
    EXPECT_FAILURE("damaged PNG: the file is cut off", Decode(png));
    Bytes jpeg = Foreign("grey.jpg");
    Bytes const size = {0, 17, 0, 33, 1};
    auto const frame = std::search(jpeg.begin(), jpeg.end(), size.begin(), size.end());
    ASSERT_NE(frame, jpeg.end());
    frame[0] = frame[2] = 0x7F;
    EXPECT_FAILURE("damaged JPEG: the file is cut off", Decode(jpeg));
    Bytes tiff = Encoded(HeadOf(FileKind::Tiff, {9, 4, 1, 8}), Bytes(36));
    SetShort(tiff, 256, 0xFFFF);
    SetShort(tiff, 257, 0xFFFF);
    EXPECT_FAILURE("damaged TIFF: the file is cut off", Decode(tiff));
}

/// A picture of each kind that has a history.
std::vector<Bytes> WithHistory() {
    std::vector<Bytes> files;
    for (FileKind const kind : {FileKind::Png, FileKind::Jpeg, FileKind::Tiff}) {
        App::PictureHead head = HeadOf(kind, {9, 4, 3, 8});
        GiveHistory(head, 50);
        files.push_back(Encoded(head, RandomPicture(head, 1).pixels));
    }
    return files;
}

// A file cut off anywhere is refused in one line, never read half or beyond its end. Only a TIFF
// has its history behind its pixels: that it is damaged is told.
TEST(ImageFile, CutOffAnywhere) {
    std::vector<Bytes> files = WithHistory();
    for (char const *const name : {"grey.jpg", "colour.jpg", "tiles.tif", "ycbcr.tif"})
        files.push_back(Foreign(name));
    files.push_back(App::EncodePng(RandomPicture({9, 4, 3, 16}, 1)));
    for (Bytes const &file : files) {
        std::size_t const end = file.size() - (file[0] == 'I' ? 4 : 0); // zeros that nobody needs
        for (std::size_t count = 8; count < end; ++count) {
            std::vector<std::string> told;
            try {
                auto const reader = Opened({file.data(), file.data() + count});
                if (reader->head().kind == FileKind::Tiff)
                    told = reader->head().metadata.losses;
                Bytes rows(reader->head().rowBytes() * reader->head().height);
                reader->read(rows.data(), reader->head().height);
            } catch (App::Failure const &failure) {
                told.push_back(failure.what());
            }
            ASSERT_FALSE(told.empty()) << count << " of " << file.size();
            EXPECT_EQ(told[0].find('\n'), std::string::npos) << told[0];
        }
    }
}

// Flipped bytes are refused or read as something else, but do no harm.
TEST(ImageFile, DamagedAnywhere) {
    std::vector<Bytes> files = WithHistory();
    for (char const *const name : {"palette-transparent.png", "tiles.tif", "big16.tif"})
        files.push_back(Foreign(name));
    for (Bytes const &file : files)
        for (std::size_t i = 3; i < file.size(); ++i) {
            Bytes damaged = file;
            damaged[i] ^= 0x81;
            try {
                Image const image = Decode(damaged);
                EXPECT_EQ(image.pixels.size(), image.rowBytes() * image.height);
            } catch (App::Failure const &) {
            }
        }
}

} // namespace
