// The program develop, run on pictures of every kind and on what is none.
#include "tests/apps/develop/developfixture.h"

#include <map>

using namespace apps_test;
using App::Image;
using testing::HasSubstr;

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
        EXPECT_EQ(tellsOf({"--quiet", "--exposure", stops, "--output", "out" + stops, "in"}), "");
        for (auto const &[name, image] : pictures)
            EXPECT_LE(WorstError(image, read("out" + stops + "/" + name), std::stod(stops)),
                      Tolerance(image))
                << name << " at " << stops;
    }
}

// Odd widths, single rows and columns, as long as the GPU takes, and a name in capitals.
TEST_F(Develop, EverySize) {
    write("huge.png", RandomPicture({kPngLimit.side, 1, 1, 8}, 0));
    std::string const refusal = develop({"huge.png"}).errors;
    std::string const reason = "huge.png: 1000000 x 1 pixels are more than the GPU takes (";
    ASSERT_THAT(refusal, HasSubstr(reason));
    std::size_t const most = std::stoul(refusal.substr(refusal.find(reason) + reason.size()));

    write("in/photo.JPG", Foreign("colour.jpg"));
    std::map<std::string, Image> pictures = {{"photo.png", read("in/photo.JPG")}};
    for (auto const &[width, height] : std::vector<std::pair<std::size_t, std::size_t>>{
             {1, 1}, {1, 9}, {9, 1}, {3, 2}, {255, 3}, {1023, 7}, {most, 1}, {1, most}})
        for (unsigned int channels : {1u, 2u, 3u, 4u})
            for (unsigned int bits : {8u, 16u}) {
                Image const image = RandomPicture({width, height, channels, bits}, channels);
                pictures[image.description() + ".png"] = image;
                write("in/" + image.description() + ".png", image);
            }
    tellsOf({"--exposure", "0.5", "in"});
    for (auto const &[name, image] : pictures)
        EXPECT_LE(WorstError(image, read("out/" + name), 0.5), Tolerance(image)) << name;
}

/// The lines of a text.
std::size_t LineCount(std::string const &text) {
    return static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n'));
}

// Each bad input is one line and spoils nothing else.
TEST_F(Develop, BadInput) {
    Image const good = RandomPicture({5, 4, 3, 8}, 1);
    Bytes const png = App::EncodePng(good), jpeg = Foreign("colour.jpg");
    Bytes noPixels = png;
    noPixels[23] = 0; // the height's last byte
    std::map<std::string, Bytes> const files = {{"first.png", png},
                                                {"empty.png", {}},
                                                {"text.png", {'h', 'e', 'l', 'l', 'o'}},
                                                {"cut.png", Beginning(png, png.size() / 2)},
                                                {"half.jpg", Beginning(jpeg, jpeg.size() / 2)},
                                                {"print.jpg", Foreign("cmyk.jpg")},
                                                {"no pixels.png", noPixels},
                                                {"folder/readme.txt", {'x'}},
                                                {"blocked.png", png},
                                                {"other/FIRST.png", png},
                                                {"last.png", png}};
    for (auto const &[name, bytes] : files)
        write(name, bytes);
    std::filesystem::create_directories(path("out/blocked.png"));
    std::pair<std::string, std::string> const problems[] = {
        {"missing.png", "no such file"},
        {"empty.png", "is empty"},
        {"text.png", "neither a PNG nor a JPEG picture"},
        {"cut.png", "damaged PNG: the file is cut off"},
        {"half.jpg", "damaged JPEG: "},
        {"print.jpg", "a JPEG in CMYK"},
        {"no pixels.png", "has no pixels (5 x 0)"},
        {"folder", "the folder has no PNG or JPEG files"},
        {"blocked.png", "cannot be written: there is a folder of this name"},
        {"other/FIRST.png", "its output out/FIRST.png is already that of first.png"}};
    std::vector<std::string> arguments = {"first.png"};
    for (auto const &problem : problems)
        arguments.push_back(problem.first);
    arguments.push_back("last.png");

    Outcome const outcome = develop(arguments);
    EXPECT_EQ(outcome.exitCode, 1);
    EXPECT_EQ(LineCount(outcome.errors), std::size(problems));
    for (auto const &[name, reason] : problems)
        EXPECT_THAT(outcome.errors, HasSubstr("develop: " + name + ": " + reason));
    EXPECT_EQ(folder_.list("out"),
              (std::vector<std::string>{"blocked.png", "first.png", "last.png"}));
    EXPECT_LE(WorstError(good, read("out/last.png"), 0.0), 1);
}

// What is wrong with a whole run is one line, too, and nothing is written.
TEST_F(Develop, BadRun) {
    write("a.png", RandomPicture({9, 6, 3, 8}, 1));
    write("b.png", RandomPicture({9, 7, 3, 8}, 1));
    write("spots", "3 3 2 1");
    write("bad spots", "3 3 2 1\n3 3 -2 1\n");
    struct Row {
        int exitCode;
        char const *problem;
        std::vector<std::string> arguments;
    };
    Row const rows[] = {
        {2, "--sharpness", {"--sharpness", "a.png"}},
        {2, "'bright' is not a number from -100 to 100", {"--exposure", "bright", "a.png"}},
        {2, "'nan' is not a number from", {"--exposure", "nan", "a.png"}},
        {2, "--output", {"a.png", "--output"}},
        {2,
         "'20.5' is not a number from 0.3 to 20",
         {"--sharpen", "1", "--radius", "20.5", "a.png"}},
        {2, "--radius requires --sharpen", {"--radius", "2", "a.png"}},
        {2, "--base requires --spots", {"--base", "b.png", "a.png"}},
        {2, "at least one picture", {}},
        {1, "a.png: cannot be made a folder", {"--output", "a.png", "a.png"}},
        {1,
         "a.png: its output ./a.png would replace a picture that is to be read",
         {"--output", ".", "a.png"}},
        {1, "GPU: the trace none/calls cannot be written", {"--trace", "none/calls", "a.png"}},
        {1,
         "GPU: there is no OpenCL device 'abacus'; there is ",
         {"--sharpen", "1", "--device", "abacus", "a.png"}},
        {1, "bad spots: line 2: the radius is negative", {"--spots", "bad spots", "a.png"}},
        {1,
         "a.png: its base b.png: is 9 x 7, RGB, 8 bit, not 9 x 6, RGB, 8 bit",
         {"--spots", "spots", "--base", "b.png", "a.png"}},
        {1,
         "a.png: its base none.png: no such file",
         {"--spots", "spots", "--base", "none.png", "a.png"}},
        {1,
         "b.png: is the base of one picture only",
         {"--spots", "spots", "--base", "b.png", "a.png", "b.png"}},
        {1,
         "a.png: its output out/a.png would replace",
         {"--spots", "spots", "--base", "out/a.png", "a.png"}}};
    for (Row const &row : rows) {
        Outcome const outcome = develop(row.arguments);
        EXPECT_EQ(outcome.exitCode, row.exitCode) << row.problem;
        EXPECT_EQ(LineCount(outcome.errors), 1u) << outcome.errors;
        EXPECT_THAT(outcome.errors, testing::StartsWith("develop: "));
        EXPECT_THAT(outcome.errors, HasSubstr(row.problem));
    }
    EXPECT_TRUE(folder_.list("out").empty());
    EXPECT_EQ(folder_.list(""),
              (std::vector<std::string>{"a.png", "b.png", "bad spots", "out", "spots"}));
}

// The first line tells about the machine; then each picture has a line with its time, and more if
// asked for.
TEST_F(Develop, TellsWhatItDoes) {
    std::string const name = "Blüte – 花 ✿.png";
    write(name, RandomPicture({61, 37, 3, 8}, 1));
    std::string const text =
        tellsOf({"--trace", "calls", "--sharpen", "1", "--device", "none", "--report", name});
    for (char const *const part : {"OpenGL ", " capabilities", "OpenCL"})
        EXPECT_THAT(text.substr(0, text.find('\n')), HasSubstr(part));
    std::vector<std::string> const parts = {name + " -> out/" + name + " (",
                                            "61 x 37, RGB, 8 bit: ",
                                            "decode ",
                                            "upload ",
                                            "sharpen ",
                                            "develop ",
                                            "read back ",
                                            "encode ",
                                            " ms"};
    for (std::string const &part : parts)
        EXPECT_THAT(text, HasSubstr(part));
    EXPECT_EQ(text.find('\x1b'), std::string::npos) << "a progress bar in a file";
    EXPECT_GT(std::filesystem::file_size(path("calls")), 1000u);
    EXPECT_EQ(tellsOf({"--version"}).rfind("develop ", 0), 0u);
    EXPECT_THAT(tellsOf({"--help"}), HasSubstr("--exposure"));
}

} // namespace
