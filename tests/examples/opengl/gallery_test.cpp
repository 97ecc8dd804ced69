// Runs the offscreen examples and compares their whole pictures with what they should be.
#include "tests/support/pictures.h"
#include "tests/support/program.h"

#include "apps/common/imagefile.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using apps_test::Outcome;
using apps_test::RunProgram;
using apps_test::TemporaryFolder;

TEST(Gallery, DrawsItsPictures) {
    constexpr App::SizeLimit kLimit = {4096};
    for (std::string const name :
         {"hello_offscreen", "float_texture", "streaming_upload", "blend_and_lines"}) {
        TemporaryFolder const folder;
        Outcome const outcome = RunProgram(name + ".exe", "picture.png", folder.path());
        EXPECT_EQ(0, outcome.exitCode);
        EXPECT_EQ("", outcome.errors);
        App::Image const wanted = App::ReadImage(ORU_EXPECTED_PICTURES "/" + name + ".png", kLimit);
        App::Image const drawn = App::ReadImage(folder.path() / "picture.png", kLimit);
        EXPECT_LE(apps_test::WorstError(wanted, drawn, 0.0), 1) << name;
    }
}

TEST(Gallery, ReportsFailures) {
    TemporaryFolder const folder;
    Outcome const usage = RunProgram("hello_offscreen.exe", "", folder.path());
    EXPECT_EQ(2, usage.exitCode);
    EXPECT_THAT(usage.errors, testing::HasSubstr("FILE"));
    Outcome const unwritable =
        RunProgram("hello_offscreen.exe", "missing/folder/picture.png", folder.path());
    EXPECT_EQ(1, unwritable.exitCode);
    EXPECT_NE("", unwritable.errors);
}
