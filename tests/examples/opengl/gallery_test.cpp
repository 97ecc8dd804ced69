// Runs the offscreen examples and compares their whole pictures with what they should be.
#include "tests/support/pictures.h"
#include "tests/support/program.h"

#include "apps/common/imagefile.h"

#include <gtest/gtest.h>

using namespace apps_test;

TEST(Gallery, DrawsItsPictures) {
    for (std::string const name :
         {"hello_offscreen", "float_texture", "streaming_upload", "blend_and_lines",
          "background_loader", "mirror_balls", "bloom", "deferred_shading"}) {
        TemporaryFolder const folder;
        Outcome const outcome = RunProgram(name + ".exe", "picture.png", folder.path());
        EXPECT_EQ(0, outcome.exitCode);
        EXPECT_EQ("", outcome.errors);
        auto const wanted = App::ReadImage(ORU_EXPECTED_PICTURES "/" + name + ".png", {4096});
        auto const drawn = App::ReadImage(folder.path() / "picture.png", {4096});
        EXPECT_LE(WorstError(wanted, drawn, 0.0), 1) << name;
    }
}

TEST(Gallery, ReportsFailures) {
    TemporaryFolder const folder;
    EXPECT_EQ(2, RunProgram("hello_offscreen.exe", "", folder.path()).exitCode);
    EXPECT_EQ(1, RunProgram("hello_offscreen.exe", "no/folder.png", folder.path()).exitCode);
}
