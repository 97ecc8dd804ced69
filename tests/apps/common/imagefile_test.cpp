// Reading and writing picture files.
#include "apps/common/imagefile.h"

#include "apps/common/failure.h"
#include "apps/common/jpegcodec.h"
#include "apps/common/pngcodec.h"
#include "apps/common/unicode.h"
#include "tests/apps/common/foreignfiles.h"
#include "tests/support/pictures.h"
#include "tests/support/program.h"

#include <gtest/gtest.h>

#include <fstream>

using namespace apps_test;
using App::Image;

namespace {

constexpr App::SizeLimit cLimit = {4096};

template<class Work>
std::string FailureOf(Work const &work) {
    try {
        work();
    } catch (App::Failure const &failure) {
        return failure.what();
    }
    return "no failure";
}

Bytes Beginning(Bytes const &bytes, std::size_t count) {
    return Bytes(bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(count));
}

std::vector<unsigned int> Values(Image const &image) {
    std::vector<unsigned int> values;
    for (std::size_t i = 0; i < ValueCount(image); ++i)
        values.push_back(Value(image, i));
    return values;
}

// What is written is read again, for every kind of pixel, at names beyond the system's code page.
TEST(ImageFile, RoundTripOfEveryKind) {
    TemporaryFolder const folder;
    std::filesystem::path const path = folder.path() / App::ToPath("Öl, 写真 ☀.png");
    for (unsigned int bits : {8u, 16u})
        for (unsigned int channels = 1; channels <= 4; ++channels) {
            Image const image = RandomPicture({13, 5, channels, bits}, channels + bits);
            App::WriteImage(path, image);
            Image const read = App::ReadImage(path, cLimit);
            EXPECT_TRUE(read == static_cast<App::Shape const &>(image)) << image.description();
            EXPECT_EQ(read.pixels, image.pixels) << image.description();
        }
    EXPECT_EQ(folder.list(""), std::vector<std::string>{"Öl, 写真 ☀.png"});
}

// Palettes, colour keys, few bits and interlacing become plain pixels.
TEST(ImageFile, ForeignPngs) {
    Image const opaque = App::DecodePng(PalettePng(false), cLimit);
    Image const transparent = App::DecodePng(PalettePng(true), cLimit);
    ASSERT_EQ(opaque.channels, 3u);
    ASSERT_EQ(transparent.channels, 4u);
    for (std::size_t i = 0; i < 15; ++i) {
        unsigned int const colour = static_cast<unsigned int>((i % 5 + i / 5) % 4);
        EXPECT_EQ(Value(opaque, 3 * i), 60 * colour);
        EXPECT_EQ(Value(opaque, 3 * i + 1), 255 - 60 * colour);
        EXPECT_EQ(Value(transparent, 4 * i + 3), colour == 1 ? 128u : 255u);
    }
    for (int bits : {1, 2, 4}) {
        Image const grey = App::DecodePng(LowDepthPng(bits), cLimit);
        EXPECT_EQ(grey.channels, 1u);
        for (std::size_t i = 0; i < 15; ++i)
            EXPECT_EQ(Value(grey, i), (i % 5 + i / 5) % (1u << bits) * (255u / ((1u << bits) - 1)));
    }
    Image const interlaced = App::DecodePng(InterlacedPng(), cLimit);
    for (unsigned int i = 0; i < 63; ++i)
        EXPECT_EQ(Value(interlaced, 3 * i + 2), i % 9 + i / 9);
    EXPECT_EQ(Values(App::DecodePng(ColourKeyPng(), cLimit)),
              (std::vector<unsigned int>{0, 255, 1, 255, 2, 0, 3, 255}));
}

TEST(ImageFile, Jpegs) {
    Image const grey = App::DecodeJpeg(Jpeg(JpegKind::Grey), cLimit);
    Image const colour = App::DecodeJpeg(Jpeg(JpegKind::YCbCr), cLimit);
    EXPECT_TRUE(grey == (App::Shape{33, 17, 1, 8}));
    EXPECT_TRUE(colour == (App::Shape{33, 17, 3, 8}));
    EXPECT_NEAR(Value(grey, 16), 16, 4);
    EXPECT_NEAR(Value(colour, 33 * 3 + 30), 38, 12);
    EXPECT_NE(FailureOf([] { App::DecodeJpeg(Jpeg(JpegKind::Cmyk), cLimit); }).find("CMYK"),
              std::string::npos);
}

// Where a pixel of the picture as it is stored comes to lie, for each way to hold a camera.
TEST(ImageFile, TurnedJpegs) {
    Image const stored = App::DecodeJpeg(Jpeg(JpegKind::YCbCr), cLimit);
    std::size_t const right = stored.width - 1, bottom = stored.height - 1;
    constexpr std::size_t x = 5, y = 3;
    std::pair<std::size_t, std::size_t> const places[] = {
        {x, y}, {right - x, y},  {right - x, bottom - y}, {x, bottom - y},
        {y, x}, {bottom - y, x}, {bottom - y, right - x}, {y, right - x}};
    for (unsigned int orientation = 1; orientation <= 8; ++orientation)
        for (bool const bigEndian : {false, true}) {
            Image const image = App::DecodeJpeg(JpegHeld(orientation, bigEndian), cLimit);
            ASSERT_EQ(image.width, orientation < 5 ? stored.width : stored.height);
            auto const [column, row] = places[orientation - 1];
            for (std::size_t c = 0; c < 3; ++c)
                EXPECT_EQ(image.row(row)[3 * column + c], stored.row(y)[3 * x + c])
                    << "orientation " << orientation;
        }
    EXPECT_EQ(App::DecodeJpeg(JpegHeld(9, false), cLimit).pixels, stored.pixels);
}

// A file cut off anywhere is refused, never read half or beyond its end.
TEST(ImageFile, CutOffAnywhere) {
    Bytes const png = App::EncodePng(RandomPicture({9, 4, 3, 16}, 1));
    for (std::size_t count = 8; count < png.size(); ++count)
        EXPECT_NE(FailureOf([&] { App::DecodePng(Beginning(png, count), cLimit); }), "no failure")
            << count << " of " << png.size();
    for (JpegKind kind : {JpegKind::Grey, JpegKind::YCbCr}) {
        Bytes const jpeg = Jpeg(kind);
        for (std::size_t count = 3; count < jpeg.size(); ++count)
            EXPECT_NE(FailureOf([&] { App::DecodeJpeg(Beginning(jpeg, count), cLimit); }),
                      "no failure")
                << count << " of " << jpeg.size();
    }
}

// Flipped bytes are refused or read as something else, but do no harm.
TEST(ImageFile, DamagedAnywhere) {
    Bytes const files[] = {App::EncodePng(RandomPicture({9, 4, 3, 8}, 1)), PalettePng(true),
                           JpegHeld(6, false)};
    for (Bytes const &file : files)
        for (std::size_t i = 3; i < file.size(); ++i) {
            Bytes damaged = file;
            damaged[i] ^= 0x81;
            try {
                Image const image = App::IsPng(damaged) ? App::DecodePng(damaged, cLimit)
                                                        : App::DecodeJpeg(damaged, cLimit);
                EXPECT_EQ(image.pixels.size(), image.rowBytes() * image.height);
            } catch (App::Failure const &) {
            }
        }
}

TEST(ImageFile, Sizes) {
    Bytes png = App::EncodePng(RandomPicture({9, 4, 3, 8}, 1));
    EXPECT_EQ(FailureOf([&] { App::DecodePng(png, {8}); }),
              "9 x 4 pixels are more than the GPU takes (8 x 8)");
    png[19] = 0;
    EXPECT_EQ(FailureOf([&] { App::DecodePng(png, {8}); }), "has no pixels (0 x 4)");
}

// A write that fails leaves what was there and nothing else.
TEST(ImageFile, WholeOrNotAtAll) {
    TemporaryFolder const folder;
    std::filesystem::create_directory(folder.path() / "taken.png");
    Image const image = RandomPicture({2, 2, 3, 8}, 1);
    EXPECT_EQ(FailureOf([&] { App::WriteImage(folder.path() / "taken.png", image); }),
              "cannot be written: there is a folder of this name");
    EXPECT_NE(FailureOf([&] { App::WriteImage(folder.path() / "no folder" / "a.png", image); }),
              "no failure");
    EXPECT_EQ(folder.list(""), std::vector<std::string>{"taken.png"});
}

} // namespace
