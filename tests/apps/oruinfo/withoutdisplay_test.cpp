// The program oruinfo where there is neither a display nor OpenGL.
#include "tests/apps/oruinfo/oruinfofixture.h"

using namespace apps_test;

using WithoutDisplay = OruInfoFixture;

TEST_F(WithoutDisplay, ReportsTheRest) {
    Json const report = reportOf(RuntimeFolder("ocl_runtime"));
    std::string const failure = report["opengl"]["failure"];
    EXPECT_THAT(failure, testing::HasSubstr("CreateDXGIFactory1"));
    for (auto const &[name, section] : report.items()) {
        bool const isThere = name == "oruinfo" || name == "library" || name == "opencl";
        EXPECT_EQ(!isThere && name != "sharing", section.contains("failure")) << name;
    }
    EXPECT_EQ("there is no OpenGL: " + failure, report["sharing"]["why_not"]);
    std::string const text = textOf("");
    EXPECT_EQ(text.find("FAILED: " + failure), text.rfind("FAILED: " + failure)) << "told twice";
}
