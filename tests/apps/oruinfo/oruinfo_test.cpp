// The program oruinfo: its forms, its parts, comparisons, and bad input.
#include "apps/oruinfo/gather.h"
#include "tests/apps/oruinfo/oruinfofixture.h"

using namespace apps_test;
using testing::HasSubstr;

using OruInfoTest = OruInfoFixture;

TEST_F(OruInfoTest, TellsEverythingOfThisMachine) {
    Json const report = reportOf(RuntimeFolder("ocl_runtime"));
    std::vector<std::string> sections = OruInfo::SectionIds();
    sections.insert(sections.begin(), "oruinfo");
    EXPECT_EQ(NamesIn(report), sections);
    for (Json const &section : report)
        EXPECT_FALSE(section.contains("failure")) << section;
    EXPECT_EQ(true, report["sharing"]["is_possible"]);

    Json const again = reportOf("--section sharing --section library");
    EXPECT_EQ(NamesIn(again), (std::vector<std::string>{"oruinfo", "library", "sharing"}));
    EXPECT_EQ(report["library"], again["library"]);
    EXPECT_THAT(again["sharing"]["devices"][0]["why_not"].get<std::string>(),
                HasSubstr("cl_khr_gl_sharing"));
}

// Without an OpenCL, or with a broken one, the rest is told.
TEST_F(OruInfoTest, ReportsTheRest) {
    std::pair<std::string, char const *> const runtimes[] = {
        {RuntimeFolder("ocl_runtime_broken"), "extensionmanagerocl.cpp"},
        {"--opencl nowhere", "no OpenCL runtime at nowhere\\OpenCL.dll"}};
    for (auto const &[option, problem] : runtimes) {
        Json const report =
            reportOf(option + " --section opencl --section sharing --section limits");
        std::string const failure = report["opencl"]["failure"];
        EXPECT_THAT(failure, HasSubstr(problem));
        EXPECT_EQ("there is no OpenCL: " + failure, report["sharing"]["why_not"]);
        EXPECT_FALSE(report["limits"].contains("failure"));
    }
}

TEST_F(OruInfoTest, WritesAPageThatNeedsNoOther) {
    EXPECT_EQ("", textOf("--html --output page.html"));
    EXPECT_THAT(folder_.list(""), testing::ElementsAre("page.html"));
    std::string const page = App::ReadText(folder_.path() / "page.html");
    for (std::string const &id : OruInfo::SectionIds())
        EXPECT_THAT(page, HasSubstr("<section id=\"" + id + "\">"));
    EXPECT_THAT(page, testing::EndsWith("</html>\n"));
    for (char const *const outside : {"<script", "<link", "src=", "url(", "http:", "https:"})
        EXPECT_THAT(page, testing::Not(HasSubstr(outside)));
}

TEST_F(OruInfoTest, ComparesReports) {
    Json report = reportOf("--section capabilities --section limits");
    write("a.json", report.dump());
    report["limits"]["max_texture_size"]["value"] = 1024;
    Json &missing = report["capabilities"]["missing"];
    missing.erase(1); // all others keep their names, at other places
    std::string const capability = report["capabilities"]["supported"][0];
    report["capabilities"]["supported"].erase(0);
    write("b.json", report.dump());
    Outcome const same = oruinfo("--diff a.json a.json"), other = oruinfo("--diff a.json b.json");
    EXPECT_EQ(0, same.exitCode);
    EXPECT_EQ(1, other.exitCode);
    EXPECT_EQ("capabilities.supported: - " + capability +
                  "\r\n"
                  "capabilities.missing[GL_APPLE_client_storage]: only in the first\r\n"
                  "limits.max_texture_size: 16384 texels -> 1024 texels\r\n",
              other.output);
}

// Each mistake is one line, and nothing is written.
TEST_F(OruInfoTest, BadInput) {
    write("report.json", R"({"oruinfo": {"schema": 1}})");
    write("later.json", R"({"oruinfo": {"schema": 2}})");
    write("other.json", "[1]");
    write("cut.json", R"({"oruinfo": {"sch)");
    std::filesystem::create_directories(folder_.path() / "folder");
    struct Line {
        int exitCode;
        char const *arguments, *problem;
    };
    Line const lines[] = {
        {2, "--section colours", "'colours' is no section"},
        {2, "--json --html", "excludes"},
        {2, "report.json", "report.json"},
        {2, "--diff report.json", "--diff"},
        {2, "--diff report.json none.json", "none.json: no such file"},
        {2, "--diff folder report.json", "folder: is a folder"},
        {2, "--diff report.json cut.json", "cut.json: is not JSON"},
        {2, "--diff other.json report.json", "other.json: is no report"},
        {2, "--diff report.json later.json", "later.json: is a report of another"},
        {2, "--diff report.json report.json --output folder", "folder: cannot"},
        {1, "--section library --output folder", "folder: cannot be written"},
        {1, "--section library --output none/r", "none/r: cannot be written"}};
    for (Line const &line : lines) {
        Outcome const outcome = oruinfo(line.arguments);
        EXPECT_EQ(outcome.exitCode, line.exitCode) << line.arguments;
        EXPECT_EQ(outcome.output, "");
        EXPECT_EQ(std::count(outcome.errors.begin(), outcome.errors.end(), '\n'), 1);
        EXPECT_THAT(outcome.errors, testing::StartsWith("oruinfo: "));
        EXPECT_THAT(outcome.errors, HasSubstr(line.problem));
    }
    EXPECT_THAT(folder_.list(""), testing::ElementsAre("cut.json", "folder", "later.json",
                                                       "other.json", "report.json"));
}
