// The program develop, run on pictures of every kind and on what is none.
#include "tests/apps/develop/developfixture.h"

using namespace apps_test;
using App::Image;
using testing::HasSubstr;

namespace {

using Develop = DevelopFixture;

std::ptrdiff_t LineCount(std::string const &text) {
    return std::count(text.begin(), text.end(), '\n');
}

// Every value of every kind of picture lies as near to the exact result as promised, also in odd
// widths, single rows and columns as long as the GPU takes, and under a name in capitals.
TEST_F(Develop, EveryValueAndSizeIsExact) {
    write("huge.png", RandomPicture({kPngLimit.side, 1, 1, 8}, 0));
    std::string const refusal = develop("huge.png").errors;
    std::string const reason = "huge.png: 1000000 x 1 pixels are more than the GPU takes (";
    ASSERT_THAT(refusal, HasSubstr(reason));
    std::size_t const most = std::stoul(refusal.substr(refusal.find(reason) + reason.size()));

    std::pair<std::size_t, std::size_t> const sizes[] = {
        {1, 9}, {9, 1}, {1023, 7}, {most, 1}, {1, most}};
    std::vector<Image> pictures;
    for (unsigned int bits : {8u, 16u})
        for (unsigned int channels = 1; channels <= 4; ++channels) {
            pictures.push_back(EveryValue(channels, bits));
            for (auto const &[width, height] : sizes)
                pictures.push_back(RandomPicture({width, height, channels, bits}, channels));
        }
    for (Image const &image : pictures)
        write("in/" + image.description() + ".png", image);
    write("in/photo.JPG", Foreign("colour.jpg"));
    for (std::string const stops : {"0", "-2.5", "1.3", "100"}) {
        EXPECT_EQ(tellsOf("--quiet --exposure " + stops + " --output out" + stops + " in"), "");
        for (Image const &image : pictures) {
            Image const developed = read("out" + stops + "/" + image.description() + ".png");
            EXPECT_LE(WorstError(image, developed, std::stod(stops)), Tolerance(image))
                << image.description() << " at " << stops;
        }
    }
    EXPECT_EQ(read("in/photo.JPG").pixels, read("out0/photo.png").pixels);
}

// Each bad input is one line and spoils nothing else.
TEST_F(Develop, BadInput) {
    Bytes const png = App::EncodePng(RandomPicture({5, 4, 3, 8}, 1)), jpeg = Foreign("colour.jpg");
    for (char const *const name : {"first.png", "taken.png", "b/FIRST.png", "last.png"})
        write(name, png);
    write("empty.png", Bytes());
    write("text.png", std::string("hi"));
    write("cut.png", Bytes(png.data(), &png[90]));
    write("half.jpg", Bytes(jpeg.data(), &jpeg[400]));
    std::filesystem::create_directories(path("out/taken.png"));
    auto const [exitCode, output, errors] =
        develop("missing.png out first.png empty.png text.png cut.png "
                "half.jpg taken.png b/FIRST.png last.png");
    EXPECT_EQ(exitCode, 1);
    for (char const *const line :
         {"missing.png: no such file", "out: the folder has no PNG, JPEG or TIFF files",
          "empty.png: is empty", "text.png: neither a PNG nor a JPEG picture",
          "cut.png: damaged PNG: the file is cut off", "half.jpg: damaged JPEG: ",
          "taken.png: cannot be written: there is a folder of this name",
          "b/FIRST.png: its output out/FIRST.png is already that of first.png"})
        EXPECT_THAT(errors, HasSubstr(std::string("develop: ") + line));
    EXPECT_EQ(LineCount(errors), 8);
    EXPECT_THAT(folder_.list("out"), testing::ElementsAre("first.png", "last.png", "taken.png"));
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
        {2, "--exposure nan a.png", "'nan' is not a number from -100 to 100"},
        {2, "--sharpen 1 --radius 20.5 a.png", "'20.5' is not a number from 0.3 to 20"},
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
    EXPECT_THAT(folder_.list(""), testing::ElementsAre("a.png", "b.png", "bad", "out", "spots"));
}

} // namespace
