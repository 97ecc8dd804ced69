// The program oruinfo on an old OpenGL, which names a capability without its functions.
#include "tests/apps/oruinfo/oruinfofixture.h"

using namespace apps_test;

using OnOldOpenGL = OruInfoFixture;

TEST_F(OnOldOpenGL, TellsWhyACapabilityIsMissing) {
    Json const missing = reportOf("--section capabilities")["capabilities"]["missing"];
    Json const lame = Row(missing, "GL_APPLE_flush_render");
    EXPECT_EQ((Json{"glFlushRenderAPPLE", "glFinishRenderAPPLE", "glSwapAPPLE"}),
              lame["missing_entry_points"]);
    EXPECT_EQ("reported, but glFlushRenderAPPLE is absent, and 2 more", lame["reason"]);
    EXPECT_EQ("not reported by the driver", Row(missing, "GL_ARB_texture_float")["reason"]);
    EXPECT_EQ("the driver's OpenGL is 2.1", Row(missing, "GL_VERSION_3_0")["reason"]);
    EXPECT_THAT(textOf("--section capabilities"),
                testing::HasSubstr("GL_APPLE_flush_render         reported, but glFlushRender"));
}
