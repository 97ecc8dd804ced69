// Runs the examples of OpenCL, which compare what they compute with the host.
#include "tests/support/program.h"

#include "apps/common/imagefile.h"
#include "apps/common/unicode.h"

#include <gmock/gmock.h>

#include <map>

using namespace apps_test;
using testing::HasSubstr;

namespace {

/// What an example tells, which must succeed.
std::string TellsOf(std::string const &name, std::string const &arguments,
                    TemporaryFolder const &folder) {
    Outcome const outcome = RunProgram(name + ".exe", arguments, folder.path());
    EXPECT_EQ(0, outcome.exitCode) << name;
    EXPECT_EQ("", outcome.errors) << name;
    return outcome.output;
}

} // namespace

TEST(ComputeGallery, ComputesWhatTheHostDoes) {
    TemporaryFolder const folder;
    std::map<std::string, std::vector<std::string>> const tells = {
        {"saxpy", {"2.5 * x + y of 1048576 values"}},
        {"reduction", {"1048576 numbers in 64 groups of 64"}},
        {"two_queues", {"1048576 numbers in 16 parts on two queues"}},
        {"build_failure",
         {"CL_BUILD_PROGRAM_FAILURE", "clBuildProgram", "GAIN'", "amplified 1000 values"}}};
    for (auto const &[name, texts] : tells) {
        std::string const output = TellsOf(name, "", folder);
        for (std::string const &text : texts)
            EXPECT_THAT(output, HasSubstr(text));
    }
}

TEST(ComputeGallery, BlursTheSameSharedAndNot) {
    TemporaryFolder const folder;
    std::string const sharing = "\"" + App::ToText(ProgramFolder() / "ocl_runtime") + "\"";
    EXPECT_THAT(TellsOf("shared_blur", "copy.png", folder), HasSubstr("on a copy"));
    EXPECT_THAT(TellsOf("shared_blur", "shared.png " + sharing, folder),
                HasSubstr("shared with OpenGL"));
    auto const copy = App::ReadImage(folder.path() / "copy.png", {4096});
    EXPECT_EQ(copy.pixels, App::ReadImage(folder.path() / "shared.png", {4096}).pixels);
    EXPECT_EQ("320 x 240, RGB, 8 bit", copy.description());
}

TEST(ComputeGallery, ReportsFailures) {
    TemporaryFolder const folder;
    std::string const cases[][2] = {
        {"saxpy", "1"}, {"shared_blur", ""}, {"shared_blur", "a.png no/such"}};
    for (auto const &[name, arguments] : cases) {
        Outcome const outcome = RunProgram(name + ".exe", arguments, folder.path());
        EXPECT_NE(0, outcome.exitCode);
        EXPECT_EQ("", outcome.output);
        EXPECT_EQ(1, std::count(outcome.errors.begin(), outcome.errors.end(), '\n'))
            << outcome.errors;
    }
    EXPECT_TRUE(folder.list(".").empty());
}
