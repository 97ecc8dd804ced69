// Reading and writing picture files.
#include "apps/common/imagefile.h"

#include "apps/common/failure.h"
#include "apps/common/unicode.h"
#include "tests/support/failure.h"
#include "tests/support/pictures.h"
#include "tests/support/program.h"

#include <algorithm>
#include <iterator>

using namespace apps_test;
using App::Decode;
using App::Image;

namespace {

// What is written is read again, for every kind of pixel, at names beyond the system's code page.
TEST(ImageFile, RoundTripOfEveryKind) {
    TemporaryFolder const folder;
    std::filesystem::path const path = folder.path() / App::ToPath("Öl, 写真 ☀.png");
    for (unsigned int bits : {8u, 16u})
        for (unsigned int channels = 1; channels <= 4; ++channels) {
            Image const image = RandomPicture({13, 5, channels, bits}, channels + bits);
            App::WriteImage(path, image);
            Image const read = App::ReadImage(path);
            EXPECT_TRUE(read == static_cast<App::Shape const &>(image)) << image.description();
            EXPECT_EQ(read.pixels, image.pixels) << image.description();
        }
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

// What is sound but of a kind that is not read is not called damaged.
TEST(ImageFile, JpegsOfOtherKinds) {
    constexpr unsigned char kBaseline[] = {0xFF, 0xC0, 0, 17, 8}; // a frame, its length, bits
    std::pair<std::ptrdiff_t, unsigned char> const kinds[] = {{1, 0xC3 /* lossless */}, {4, 12}};
    for (auto const &[at, value] : kinds) {
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
}

// Before memory is taken and before anything else is looked at.
TEST(ImageFile, PngTooShortForItsSize) {
    Bytes png = App::EncodePng(RandomPicture({9, 4, 3, 8}, 1));
    png[18] = png[22] = 0x0F; // 3849 by 3844 pixels
    EXPECT_FAILURE("damaged PNG: the file is cut off", Decode(png));
}

/// A JPEG with Exif data that tell its orientation, in either byte order.
Bytes Held(Bytes jpeg, unsigned char orientation, bool bigEndian) {
    Bytes const little = {'E',  'x', 'i', 'f', 0, 0, 'I', 'I', 42,          0, 8, 0, 0, 0, 1, 0,
                          0x12, 1,   3,   0,   1, 0, 0,   0,   orientation, 0, 0, 0, 0, 0, 0, 0};
    Bytes const big = {'E', 'x',  'i', 'f', 0, 0, 'M', 'M', 0, 42,          0, 0, 0, 8, 0, 1,
                       1,   0x12, 0,   3,   0, 0, 0,   1,   0, orientation, 0, 0, 0, 0, 0, 0};
    Bytes const &exif = bigEndian ? big : little;
    jpeg.insert(jpeg.begin() + 2, exif.begin(), exif.end());
    jpeg.insert(jpeg.begin() + 2, {0xFF, 0xE1, 0, static_cast<unsigned char>(exif.size() + 2)});
    return jpeg;
}

// Where a pixel of the picture as it is stored comes to lie, for each way to hold a camera.
TEST(ImageFile, TurnedJpegs) {
    Bytes const jpeg = Foreign("colour.jpg");
    Image const stored = Decode(jpeg);
    std::size_t const right = stored.width - 1, bottom = stored.height - 1;
    std::size_t const x = 5, y = 3;
    std::pair<std::size_t, std::size_t> const places[] = {
        {x, y}, {right - x, y},  {right - x, bottom - y}, {x, bottom - y},
        {y, x}, {bottom - y, x}, {bottom - y, right - x}, {y, right - x}};
    for (unsigned char orientation = 1; orientation <= 8; ++orientation)
        for (bool const bigEndian : {false, true}) {
            Image const image = Decode(Held(jpeg, orientation, bigEndian));
            ASSERT_EQ(image.width, orientation < 5 ? stored.width : stored.height);
            auto const [column, row] = places[orientation - 1];
            for (std::size_t c = 0; c < 3; ++c)
                EXPECT_EQ(image.row(row)[3 * column + c], stored.row(y)[3 * x + c])
                    << "orientation " << int{orientation};
        }
}

// A file cut off anywhere is refused, never read half or beyond its end.
TEST(ImageFile, CutOffAnywhere) {
    for (Bytes const &file : {App::EncodePng(RandomPicture({9, 4, 3, 16}, 1)), Foreign("grey.jpg"),
                              Foreign("colour.jpg")})
        for (std::size_t count = 8; count < file.size(); ++count)
            EXPECT_THROW(Decode({file.data(), file.data() + count}), App::Failure)
                << count << " of " << file.size();
}

// Flipped bytes are refused or read as something else, but do no harm.
TEST(ImageFile, DamagedAnywhere) {
    for (Bytes const &file :
         {App::EncodePng(RandomPicture({9, 4, 3, 8}, 1)), Foreign("palette-transparent.png"),
          Held(Foreign("colour.jpg"), 6, false)})
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
