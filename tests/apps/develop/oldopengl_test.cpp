// The program develop on an old OpenGL, whose version the environment fixes.
#include "tests/apps/develop/developfixture.h"
#include "tests/support/pictures.h"

#include <cstdlib>

using namespace apps_test;

namespace {

using DevelopOnOldOpenGL = DevelopFixture;

TEST_F(DevelopOnOldOpenGL, WorksFromVersion3On) {
    char const *const setting = std::getenv("ORU_TEST_VERSION");
    ASSERT_NE(setting, nullptr);
    std::string const version = setting;
    App::Image const colour = EveryValue(4, 16);
    App::Image const grey = EveryValue(1, 8);
    write("colour.png", colour);
    write("grey.png", grey);
    Outcome const outcome =
        develop({"--exposure", "0.7", "--sharpen", "0", "colour.png", "grey.png"});
    if (version < "3.0") {
        EXPECT_EQ(outcome.exitCode, 1);
        ASSERT_EQ(outcome.errorLines().size(), 1u) << outcome.errors;
        EXPECT_TRUE(Reports(outcome, "GPU", "OpenGL 3.0 is needed, this is " + version));
        return;
    }
    ASSERT_EQ(outcome.exitCode, 0) << outcome.errors;
    EXPECT_NE(outcome.output.find("OpenGL " + version), std::string::npos) << outcome.output;
    EXPECT_LE(WorstError(colour, read("out/colour.png"), 0.7), Tolerance(colour));
    EXPECT_LE(WorstError(grey, read("out/grey.png"), 0.7), Tolerance(grey));
    // Sharpening and spots use shaders of their own.
    write("spots.txt", std::vector<unsigned char>{'9', ' ', '9', ' ', '5', ' ', '1'});
    Outcome const more = develop({"--sharpen", "1", "--device", "none", "--spots", "spots.txt",
                                  "--output", "more", "colour.png"});
    EXPECT_EQ(more.exitCode, 0) << more.errors;
}

} // namespace
