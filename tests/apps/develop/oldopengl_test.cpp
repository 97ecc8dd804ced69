// The program develop on an old OpenGL, whose version the environment fixes.
#include "tests/apps/develop/developfixture.h"

#include <cstdlib>

using namespace apps_test;

namespace {

using DevelopOnOldOpenGL = DevelopFixture;

TEST_F(DevelopOnOldOpenGL, WorksFromVersion3On) {
    char const *const asked = std::getenv("MESA_GL_VERSION_OVERRIDE");
    ASSERT_NE(nullptr, asked);
    std::string const version = std::string(asked).substr(0, 3);
    App::Image const colour = EveryValue(4, 16);
    write("colour.png", colour);
    write("spots.txt", "9 9 5 1");
    if (version < "3.0") {
        EXPECT_THAT(develop("colour.png").errors,
                    testing::StartsWith("develop: GPU: OpenGL 3.0 is needed, this is " + version));
        return;
    }
    EXPECT_THAT(tellsOf("--exposure 0.7 colour.png"), testing::HasSubstr("OpenGL " + version));
    EXPECT_LE(WorstError(colour, read("out/colour.png"), 0.7), Tolerance(colour));
    // Sharpening and spots use shaders of their own.
    tellsOf("--sharpen 1 --device none --spots spots.txt colour.png");
}

} // namespace
