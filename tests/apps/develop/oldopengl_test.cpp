// The program develop on an old OpenGL, whose version the environment fixes.
#include "tests/apps/develop/developfixture.h"

#include <cstdlib>

using namespace apps_test;
using testing::HasSubstr;

namespace {

using DevelopOnOldOpenGL = DevelopFixture;

TEST_F(DevelopOnOldOpenGL, WorksFromVersion3On) {
    char const *const setting = std::getenv("MESA_GL_VERSION_OVERRIDE");
    ASSERT_NE(setting, nullptr);
    std::string const version = std::string(setting).substr(0, 3);
    App::Image const colour = EveryValue(4, 16);
    App::Image const grey = EveryValue(1, 8);
    write("colour.png", colour);
    write("grey.png", grey);
    if (version < "3.0") {
        Outcome const outcome = develop("grey.png");
        EXPECT_EQ(outcome.exitCode, 1);
        EXPECT_THAT(outcome.errors,
                    testing::StartsWith("develop: GPU: OpenGL 3.0 is needed, this is " + version));
        return;
    }
    EXPECT_THAT(tellsOf("--exposure 0.7 --sharpen 0 colour.png grey.png"),
                HasSubstr("OpenGL " + version));
    EXPECT_LE(WorstError(colour, read("out/colour.png"), 0.7), Tolerance(colour));
    EXPECT_LE(WorstError(grey, read("out/grey.png"), 0.7), Tolerance(grey));
    // Sharpening and spots use shaders of their own.
    write("spots.txt", "9 9 5 1");
    tellsOf("--sharpen 1 --device none --spots spots.txt colour.png");
}

} // namespace
