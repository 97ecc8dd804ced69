// Runs the programs in two forms, plain calls and the library's classes, which must draw the same.
#include "tests/support/program.h"

#include "apps/common/imagefile.h"

#include <gtest/gtest.h>

#include <set>

using namespace apps_test;

TEST(Ported, BothFormsDrawTheSamePictures) {
    TemporaryFolder const folder;
    Outcome const outcome = RunProgram("ported.exe", ".", folder.path());
    EXPECT_EQ(0, outcome.exitCode);
    EXPECT_EQ("", outcome.errors);
    EXPECT_EQ(std::string::npos, outcome.output.find("DIFFERENT")) << outcome.output;
    auto const files = folder.list("");
    EXPECT_EQ(8u, files.size());
    std::set<std::vector<unsigned char>> pictures;
    for (auto const &file : files) {
        auto const picture = App::ReadImage(folder.path() / file);
        std::set<std::vector<unsigned char>> colours;
        for (auto pixel = picture.pixels.begin(); pixel != picture.pixels.end(); pixel += 3)
            colours.emplace(pixel, pixel + 3);
        EXPECT_LT(10u, colours.size()) << file;
        pictures.insert(picture.pixels);
    }
    EXPECT_EQ(8u, pictures.size());
}

TEST(Ported, ReportsFailures) {
    TemporaryFolder const folder;
    EXPECT_EQ(1, RunProgram("ported.exe", "no/folder", folder.path()).exitCode);
}
