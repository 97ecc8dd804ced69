// The program develop, run on pictures of every kind and on what is none.
#include "tests/apps/develop/developfixture.h"

#include <map>

using namespace apps_test;
using App::Image;
using testing::HasSubstr;

namespace {

using Develop = DevelopFixture;

std::ptrdiff_t LineCount(std::string const &text) {
    return std::count(text.begin(), text.end(), '\n');
}

// Every value, of every kind of picture, lies as near to the exact result as promised.
TEST_F(Develop, EveryValueIsExact) {
    std::map<std::string, Image> pictures;
    for (unsigned int bits : {8u, 16u})
        for (unsigned int channels = 1; channels <= 4; ++channels) {
            std::string const name = std::to_string(channels) + "x" + std::to_string(bits) + ".png";
            pictures[name] = EveryValue(channels, bits);
            write("in/" + name, pictures[name]);
        }
    for (std::string const stops : {"0", "-2.5", "1.3", "100"}) {
        EXPECT_EQ(tellsOf("--quiet --exposure " + stops + " --output out" + stops + " in"), "");
        for (auto const &[name, image] : pictures)
            EXPECT_LE(WorstError(image, read("out" + stops + "/" + name), std::stod(stops)),
                      Tolerance(image))
                << name << " at " << stops;
    }
}

// Odd widths, single rows and columns, as long as the GPU takes, and a name in capitals.
TEST_F(Develop, EverySize) {
    write("huge.png", RandomPicture({kPngLimit.side, 1, 1, 8}, 0));
    std::string const refusal = develop("huge.png").errors;
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
    tellsOf("--exposure 0.5 in");
    for (auto const &[name, image] : pictures)
        EXPECT_LE(WorstError(image, read("out/" + name), 0.5), Tolerance(image)) << name;
}

// Each bad input is one line and spoils nothing else.
TEST_F(Develop, BadInput) {
    Image const good = RandomPicture({5, 4, 3, 8}, 1);
    Bytes const png = App::EncodePng(good), jpeg = Foreign("colour.jpg");
    Bytes noPixels = png;
    noPixels[23] = 0; // the height's last byte
    struct Row {
        std::string input, file;
        Bytes bytes;
        std::string reason;
    };
    Row const rows[] = {
        {"first.png", "first.png", png, ""},
        {"missing.png", "unasked.png", png, "no such file"},
        {"empty.png", "empty.png", {}, "is empty"},
        {"text.png", "text.png", {'h', 'i'}, "neither a PNG nor a JPEG picture"},
        {"cut.png", "cut.png", Beginning(png, 90), "damaged PNG: the file is cut off"},
        {"half.jpg", "half.jpg", Beginning(jpeg, 400), "damaged JPEG: "},
        {"print.jpg", "print.jpg", Foreign("cmyk.jpg"), "a JPEG in CMYK"},
        {"flat.png", "flat.png", noPixels, "has no pixels (5 x 0)"},
        {"folder", "folder/a.txt", {}, "the folder has no PNG or JPEG files"},
        {"taken.png", "taken.png", png, "cannot be written: there is a folder of this name"},
        {"b/FIRST.png", "b/FIRST.png", png,
         "its output out/FIRST.png is already that of first.png"},
        {"last.png", "last.png", png, ""}};
    std::filesystem::create_directories(path("out/taken.png"));
    std::string arguments;
    for (Row const &row : rows) {
        write(row.file, row.bytes);
        arguments += row.input + " ";
    }
    auto const [exitCode, output, errors] = develop(arguments);
    EXPECT_EQ(exitCode, 1);
    for (Row const &row : rows)
        if (!row.reason.empty()) {
            EXPECT_THAT(errors, HasSubstr("develop: " + row.input + ": " + row.reason));
        }
    EXPECT_EQ(LineCount(errors), 10);
    EXPECT_EQ(folder_.list("out"),
              (std::vector<std::string>{"first.png", "last.png", "taken.png"}));
    EXPECT_LE(WorstError(good, read("out/last.png"), 0.0), 1);
}

// What is wrong with a whole run is one line, too, and nothing is written.
TEST_F(Develop, BadRun) {
    write("a.png", RandomPicture({9, 6, 3, 8}, 1));
    write("b.png", RandomPicture({9, 7, 3, 8}, 1));
    write("spots", "3 3 2 1");
    write("bad", "3 3 2 1\n3 3 -2 1\n");
    struct Row {
        int exitCode;
        char const *arguments, *problem;
    };
    Row const rows[] = {
        {2, "--sharpness a.png", "--sharpness"},
        {2, "--exposure bright a.png", "'bright' is not a number from -100 to 100"},
        {2, "--exposure nan a.png", "'nan' is not a number from"},
        {2, "a.png --output", "--output"},
        {2, "--sharpen 1 --radius 20.5 a.png", "'20.5' is not a number from 0.3 to 20"},
        {2, "--radius 2 a.png", "--radius requires --sharpen"},
        {2, "--base b.png a.png", "--base requires --spots"},
        {2, "", "at least one picture"},
        {1, "--output a.png a.png", "a.png: cannot be made a folder"},
        {1, "--output . a.png", "its output ./a.png would replace a picture that is to be read"},
        {1, "--trace none/calls a.png", "GPU: the trace none/calls cannot be written"},
        {1, "--sharpen 1 --device abacus a.png",
         "GPU: there is no OpenCL device 'abacus'; there is "},
        {1, "--spots bad a.png", "bad: line 2: the radius is negative"},
        {1, "--spots spots --base b.png a.png",
         "a.png: its base b.png: is 9 x 7, RGB, 8 bit, not 9 x 6, RGB, 8 bit"},
        {1, "--spots spots --base none.png a.png", "a.png: its base none.png: no such file"},
        {1, "--spots spots --base b.png a.png b.png", "b.png: is the base of one picture only"},
        {1, "--spots spots --base out/a.png a.png", "a.png: its output out/a.png would replace"}};
    for (Row const &row : rows) {
        Outcome const outcome = develop(row.arguments);
        EXPECT_EQ(outcome.exitCode, row.exitCode) << row.arguments;
        EXPECT_EQ(LineCount(outcome.errors), 1) << outcome.errors;
        EXPECT_THAT(outcome.errors, testing::StartsWith("develop: "));
        EXPECT_THAT(outcome.errors, HasSubstr(row.problem));
    }
    EXPECT_TRUE(folder_.list("out").empty());
    EXPECT_EQ(folder_.list(""),
              (std::vector<std::string>{"a.png", "b.png", "bad", "out", "spots"}));
}

// The first line tells about the machine; then each picture has a line with its time, and more if
// asked for.
TEST_F(Develop, TellsWhatItDoes) {
    std::string const name = "Blüte – 花 ✿.png";
    write(name, RandomPicture({61, 37, 3, 8}, 1));
    std::string const text =
        tellsOf("--trace calls --sharpen 1 --device none --report \"" + name + "\"");
    for (char const *const part : {"OpenGL ", " capabilities", "OpenCL"})
        EXPECT_THAT(text.substr(0, text.find('\n')), HasSubstr(part));
    EXPECT_THAT(text, HasSubstr(name + " -> out/" + name + " ("));
    for (char const *const part : {"61 x 37, RGB, 8 bit: ", "decode ", "upload ", "sharpen ",
                                   "develop ", "read back ", "encode ", " ms"})
        EXPECT_THAT(text, HasSubstr(part));
    EXPECT_EQ(text.find('\x1b'), std::string::npos) << "a progress bar in a file";
    EXPECT_GT(std::filesystem::file_size(path("calls")), 1000u);
    EXPECT_EQ(tellsOf("--version").rfind("develop ", 0), 0u);
    EXPECT_THAT(tellsOf("--help"), HasSubstr("--exposure"));
}

} // namespace
