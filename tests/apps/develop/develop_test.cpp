// The program develop, run on pictures of every kind and on what is none.
#include "tests/apps/common/foreignfiles.h"
#include "tests/apps/develop/developfixture.h"
#include "tests/support/pictures.h"

#include <map>

using namespace apps_test;
using App::Image;

namespace {

using Develop = DevelopFixture;

// Every value, of every kind of picture, lies as near to the exact result as promised.
TEST_F(Develop, EveryValueIsExact) {
    std::map<std::string, Image> pictures;
    for (unsigned int bits : {8u, 16u})
        for (unsigned int channels = 1; channels <= 4; ++channels)
            pictures[std::to_string(channels) + "x" + std::to_string(bits) + ".png"] =
                EveryValue(channels, bits);
    for (auto const &[name, image] : pictures)
        write("in/" + name, image);
    for (std::string const stops : {"0", "-2.5", "1.3", "100"}) {
        Outcome const outcome =
            develop({"--quiet", "--exposure", stops, "--output", "out" + stops, "in"});
        ASSERT_EQ(outcome.exitCode, 0) << outcome.errors;
        EXPECT_EQ(outcome.output + outcome.errors, "");
        for (auto const &[name, image] : pictures)
            EXPECT_LE(WorstError(image, read("out" + stops + "/" + name), std::stod(stops)),
                      Tolerance(image))
                << name << " at " << stops;
    }
}

// Odd widths, single rows and columns, and as long as the GPU takes.
TEST_F(Develop, EverySize) {
    write("huge.png", RandomPicture({cLimit.side, 1, 1, 8}, 0));
    Outcome const refusal = develop({"huge.png"});
    EXPECT_EQ(refusal.exitCode, 1);
    ASSERT_TRUE(Reports(refusal, "huge.png", "more than the GPU takes ("));
    auto const most = static_cast<std::size_t>(
        std::stoul(refusal.errors.substr(refusal.errors.find("takes (") + 7)));

    std::map<std::string, Image> pictures;
    for (auto const &[width, height] : std::vector<std::pair<std::size_t, std::size_t>>{
             {1, 1}, {1, 9}, {9, 1}, {3, 2}, {255, 3}, {1023, 7}, {most, 1}, {1, most}})
        for (unsigned int channels : {1u, 2u, 3u, 4u})
            for (unsigned int bits : {8u, 16u}) {
                Image const image = RandomPicture({width, height, channels, bits}, channels);
                pictures[image.description() + ".png"] = image;
            }
    for (auto const &[name, image] : pictures)
        write("in/" + name, image);
    Outcome const outcome = develop({"--exposure", "0.5", "in"});
    ASSERT_EQ(outcome.exitCode, 0) << outcome.errors;
    for (auto const &[name, image] : pictures)
        EXPECT_LE(WorstError(image, read("out/" + name), 0.5), Tolerance(image)) << name;
}

// Palettes, few bits, colour keys, interlacing and JPEGs are developed as what they stand for.
TEST_F(Develop, ForeignFiles) {
    std::map<std::string, Bytes> const files = {
        {"palette.png", PalettePng(false)},   {"transparent.png", PalettePng(true)},
        {"one bit.png", LowDepthPng(1)},      {"interlaced.png", InterlacedPng()},
        {"key.png", ColourKeyPng()},          {"grey.jpeg", Jpeg(JpegKind::Grey)},
        {"colour.JPG", Jpeg(JpegKind::YCbCr)}};
    for (auto const &[name, bytes] : files)
        write("in/" + name, bytes);
    ASSERT_EQ(develop({"--exposure=-1", "in"}).exitCode, 0);
    for (auto const &[name, bytes] : files) {
        Image const image = read("in/" + name);
        std::string const stem = name.substr(0, name.find('.'));
        EXPECT_LE(WorstError(image, read("out/" + stem + ".png"), -1), 1) << name;
    }
}

// Each bad input is one line and spoils nothing else.
TEST_F(Develop, BadInput) {
    Image const good = RandomPicture({5, 4, 3, 8}, 1);
    Bytes const png = App::EncodePng(good);
    Bytes const jpeg = Jpeg(JpegKind::YCbCr);
    auto const half = [](Bytes const &bytes) {
        return Bytes(bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(bytes.size() / 2));
    };
    Bytes noPixels = png;
    noPixels[23] = 0; // the height's last byte
    write("empty.png", Bytes());
    write("text.png", Bytes{'h', 'e', 'l', 'l', 'o'});
    write("cut.png", half(png));
    write("half.jpg", half(jpeg));
    write("print.jpg", Jpeg(JpegKind::Cmyk));
    write("no pixels.png", noPixels);
    write("folder/readme.txt", Bytes{'x'});
    write("first.png", png);
    write("last.png", png);
    write("other/LAST.png", png);
    write("blocked.png", png);
    std::filesystem::create_directories(path("out/blocked.png"));

    Outcome const outcome = develop({"first.png", "missing.png", "empty.png", "text.png", "cut.png",
                                     "half.jpg", "print.jpg", "no pixels.png", "folder",
                                     "blocked.png", "last.png", "other/LAST.png"});
    EXPECT_EQ(outcome.exitCode, 1);
    EXPECT_EQ(outcome.errorLines().size(), 10u) << outcome.errors;
    EXPECT_TRUE(Reports(outcome, "missing.png", "no such file"));
    EXPECT_TRUE(Reports(outcome, "empty.png", "is empty"));
    EXPECT_TRUE(Reports(outcome, "text.png", "neither a PNG nor a JPEG"));
    EXPECT_TRUE(Reports(outcome, "cut.png", "cut off"));
    EXPECT_TRUE(Reports(outcome, "half.jpg", "damaged JPEG"));
    EXPECT_TRUE(Reports(outcome, "print.jpg", "CMYK"));
    EXPECT_TRUE(Reports(outcome, "no pixels.png", "has no pixels"));
    EXPECT_TRUE(Reports(outcome, "folder", "has no PNG or JPEG files"));
    EXPECT_TRUE(Reports(outcome, "blocked.png", "folder of this name"));
    EXPECT_TRUE(Reports(outcome, "other/LAST.png", "already that of last.png"));
    EXPECT_EQ(folder_.list("out"),
              (std::vector<std::string>{"blocked.png", "first.png", "last.png"}));
    EXPECT_LE(WorstError(good, read("out/last.png"), 0), 1);
}

// An output folder that is none, and outputs that would replace an input.
TEST_F(Develop, BadOutput) {
    Bytes const png = App::EncodePng(RandomPicture({5, 4, 3, 8}, 1));
    write("a.png", png);
    Outcome outcome = develop({"--output", "a.png", "a.png"});
    EXPECT_EQ(outcome.exitCode, 1);
    EXPECT_TRUE(Reports(outcome, "a.png", "cannot be made a folder"));
    outcome = develop({"--output", ".", "a.png"});
    EXPECT_EQ(outcome.exitCode, 1);
    EXPECT_TRUE(Reports(outcome, "a.png", "would replace a picture that is to be read"));
    EXPECT_EQ(folder_.list(""), std::vector<std::string>{"a.png"});
}

// The first line tells about the machine; then each picture has a line with its time.
TEST_F(Develop, TellsWhatItDoes) {
    std::string const name = "Blüte – 花 ✿.png";
    write(name, RandomPicture({5, 4, 3, 8}, 1));
    Outcome const outcome = develop({"--trace", "calls.txt", name});
    ASSERT_EQ(outcome.exitCode, 0) << outcome.errors;
    std::string const first = outcome.output.substr(0, outcome.output.find('\n'));
    for (char const *const part : {"OpenGL ", " capabilities", "OpenCL"})
        EXPECT_NE(first.find(part), std::string::npos) << first;
    EXPECT_NE(outcome.output.find(name + " -> out/" + name + " ("), std::string::npos)
        << outcome.output;
    EXPECT_EQ(outcome.output.find('\x1b'), std::string::npos) << "a progress bar in a file";
    EXPECT_GT(std::filesystem::file_size(path("calls.txt")), 1000u);
}

TEST_F(Develop, CommandLine) {
    EXPECT_EQ(develop({"--version"}).output.rfind("develop ", 0), 0u);
    EXPECT_NE(develop({"--help"}).output.find("--exposure"), std::string::npos);
    std::map<std::string, std::vector<std::string>> const mistakes = {
        {"--sharpness", {"--sharpness", "a.png"}},
        {"'bright' is not a number from -100 to 100", {"--exposure", "bright", "a.png"}},
        {"'nan' is not a number from", {"--exposure", "nan", "a.png"}},
        {"--output", {"a.png", "--output"}},
        {"'20.5' is not a number from 0.3 to 20", {"--sharpen", "1", "--radius", "20.5", "a.png"}},
        {"--radius requires --sharpen", {"--radius", "2", "a.png"}},
        {"--base requires --spots", {"--base", "b.png", "a.png"}},
        {"at least one picture", {}}};
    for (auto const &[part, arguments] : mistakes) {
        Outcome const outcome = develop(arguments);
        EXPECT_EQ(outcome.exitCode, 2) << part;
        EXPECT_EQ(outcome.errorLines().size(), 1u) << outcome.errors;
        EXPECT_NE(outcome.errors.find(part), std::string::npos) << outcome.errors;
    }
}

} // namespace
