// The program develop, run on pictures of every kind and on what is none.
#include "apps/common/picturefile.h"
#include "apps/common/tracefile.h"
#include "apps/develop/pace.h"
#include "tests/apps/develop/developfixture.h"

#include <nlohmann/json.hpp>
#include <windows.h>

using namespace apps_test;
using App::Image;
using Json = nlohmann::json;
using testing::HasSubstr;

namespace {

using Develop = DevelopFixture;

std::ptrdiff_t LineCount(std::string const &text) {
    return std::count(text.begin(), text.end(), '\n');
}

// Every value of every kind of picture lies as near to the exact result as promised, also in odd
// widths, single rows and columns longer than a texture may be, and under a name in capitals.
TEST_F(Develop, EveryValueAndSizeIsExact) {
    std::pair<std::size_t, std::size_t> const sizes[] = {
        {1, 9}, {9, 1}, {1023, 7}, {20001, 1}, {1, 20001}};
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
          "empty.png: is empty", "text.png: neither a PNG, a JPEG nor a TIFF picture",
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
        {2, "--format bmp a.png", "'bmp' is none of png, jpeg, tiff, same"},
        {1, "--list a.png", "a.png: is not a list of paths in UTF-8"},
        {1, "--json b.png a.png", "b.png: has the name of a picture, which it would replace"},
        {1, "--trace b.png a.png", "b.png: has the name of a picture, which it would replace"},
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

// Each photo of a list is told to programs as what it became, and one that fails keeps no other.
TEST_F(Develop, AListAndItsReport) {
    Image const image = RandomPicture({5, 4, 3, 8}, 1);
    write("#1 \u00e4.png", image);
    write("b.jpg", Foreign("colour.jpg"));
    write("broken.png", std::string("hi"));
    write("list", std::string("\xEF\xBB\xBF#1 \u00e4.png\r\n\r\ngone.tif\nbroken.png\r\nb.jpg"));
    auto const statuses = [](Json const &report) {
        std::string text;
        for (Json const &photo : report["photos"])
            text += photo["input"].get<std::string>() + " > " + photo["output"].get<std::string>() +
                    " " + photo["status"].get<std::string>() + " " + photo.value("reason", "") +
                    "\n";
        for (auto const *const status : {"photos", "developed", "failed", "skipped", "cancelled"})
            text += report["totals"][status].dump() + " ";
        return text;
    };

    EXPECT_EQ(develop("--quiet --list list --format same --json report.json").exitCode, 1);
    Json const first = Json::parse(App::ReadText(path("report.json")));
    EXPECT_THAT(statuses(first),
                testing::MatchesRegex("#1 \u00e4.png > out/#1 \u00e4.png developed \n"
                                      "gone.tif > out/gone.tif failed no such file\n"
                                      "broken.png > out/broken.png failed .+\n"
                                      "b.jpg > out/b.jpg developed \n"
                                      "4 2 2 0 0 "));
    EXPECT_EQ(first["photos"][0]["width"], 5);
    EXPECT_THAT(first["photos"][0]["colourSpace"], testing::HasSubstr("sRGB"));
    EXPECT_EQ(App::OpenPicture(path("out/b.jpg"))->head().kind, App::FileKind::Jpeg);

    write("out/b.jpg", std::string("mine"));
    write("broken.png", image);
    Outcome const again = develop("--list list --format same --skip-existing --json -");
    EXPECT_EQ(again.exitCode, 1);
    EXPECT_THAT(statuses(Json::parse(again.output)), HasSubstr("\n4 1 1 2 0 "));
    EXPECT_THAT(again.errors, HasSubstr("1 of 4 pictures in "));
    EXPECT_THAT(again.errors, HasSubstr(", 2 skipped; 1 failed"));
    EXPECT_EQ(App::ReadText(path("out/b.jpg")), "mine");
}

// Ctrl-C leaves whole pictures and nothing else.
TEST_F(Develop, CancelledRun) {
    write("in/100.png", RandomPicture({400, 300, 3, 8}, 1));
    for (int i = 101; i < 140; ++i)
        std::filesystem::copy_file(path("in/100.png"), path("in/" + std::to_string(i) + ".png"));
    Process const program("develop.exe",
                          "--quiet --sharpen 1 --radius 20 --device none --json report in",
                          folder_.path());
    for (int tries = 0; tries < 10000 && !std::filesystem::exists(path("out/100.png")); ++tries)
        ::Sleep(5);
    program.pressControlC();
    EXPECT_EQ(program.exitCode(), 130);
    Json const totals = Json::parse(App::ReadText(path("report")))["totals"];
    std::vector<std::string> const files = folder_.list("out");
    EXPECT_EQ(totals["developed"], files.size());
    EXPECT_EQ(totals["cancelled"], 40 - files.size());
    EXPECT_LT(files.size(), 40u);
    for (std::string const &file : files)
        EXPECT_EQ(read("out/" + file).height, 300u) << file;
}

TEST(Pace, IsThatOfTheLastPhotos) {
    ::Develop::Pace pace(0);
    for (int i = 0; i <= 20; ++i)
        pace.add(1000 + 2 * i);
    EXPECT_EQ(pace.text(90), "30 photos a minute, 3 min 0 s left");
}

// The calls before a crash are what a trace is read for.
TEST_F(Develop, TraceOfACrash) {
    App::TraceFile trace(App::ToText(path("calls")));
    trace.stream() << "the last call";
    EXCEPTION_RECORD record = {};
    EXCEPTION_POINTERS crash = {&record, nullptr};
    ::SetUnhandledExceptionFilter(nullptr)(&crash);
    EXPECT_EQ(App::ReadText(path("calls")), "the last call");
}

} // namespace
