// The pieces of oruinfo: reports of drivers that fail on command, and of texts of any kind.
#include "apps/common/file.h"
#include "apps/oruinfo/drivers.h"
#include "apps/oruinfo/gather.h"
#include "apps/oruinfo/reportdiff.h"
#include "apps/oruinfo/writers.h"
#include "tests/apps/oruinfo/schema.h"
#include "tests/support/program.h"
#include "tests/support/testruntime.h"

#include <gmock/gmock.h>

using namespace apps_test;
using namespace OruInfo;

namespace {

std::size_t Occurrences(std::string const &text, std::string const &part) {
    std::size_t count = 0;
    for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1))
        ++count;
    return count;
}

/// The places of all values.
std::vector<Json::json_pointer> Leaves(Json const &report) {
    std::vector<Json::json_pointer> places;
    Json const flat = report.flatten();
    for (auto const &[place, value] : flat.items())
        places.emplace_back(place);
    return places;
}

} // namespace

// Whatever a machine lacks, a report has the fields that the schema names and no others; and every
// field that the schema names is in one of the reports here.
TEST(ReportTest, SurvivesEveryFailureOfADriver) {
    Schema schema(Json::parse(App::ReadText(ORU_REPORT_SCHEMA)));
    oru_test::TestRuntime const runtime("ocl_runtime");
    auto const gather = [&schema](std::vector<std::string> const &sections, Drivers &drivers) {
        Json const report = Json::parse(JsonOf(Gather(sections, drivers)));
        EXPECT_THAT(schema.problems(report), testing::IsEmpty());
        return report.dump();
    };
    Drivers drivers(runtime.folder());
    gather({}, drivers);
    Drivers unopened(""); // as others are open
    gather({}, unopened);

    // Each call of OpenCL fails once.
    unsigned int failures = 0;
    for (char const *const entryPoint : {"clGetPlatformIDs", "clGetPlatformInfo", "clGetDeviceIDs",
                                         "clGetDeviceInfo", "clCreateContext"}) {
        runtime->reset();
        std::string const whole = gather({"opencl", "sharing"}, drivers);
        unsigned int const calls = runtime->calls(entryPoint);
        for (unsigned int call = 1; call <= calls; ++call) {
            runtime->reset();
            runtime->fail(entryPoint, call, CL_OUT_OF_HOST_MEMORY);
            std::string const told = gather({"opencl", "sharing"}, drivers);
            failures += told != whole ? 1u : 0u;
            EXPECT_TRUE(told == whole || Occurrences(told, "CL_OUT_OF_HOST_MEMORY") > 0)
                << entryPoint << ' ' << call << ": " << told;
        }
    }
    EXPECT_GT(failures, 50u);
    EXPECT_TRUE(runtime->references().empty());
    // Nothing breaks these here; the displays' failure is another test's.
    EXPECT_THAT(schema.unseen(), testing::ElementsAre("/$defs/displays/properties/failure",
                                                      "/$defs/library/properties/failure"));
}

// Flags and enumerations by their names, numbers whole, what is younger than the names as a number.
TEST(ReportTest, ReadsEachKindOfProperty) {
    oru_test::TestRuntime const runtime("ocl_runtime");
    Drivers drivers(runtime.folder());
    drivers.openOpenCL();
    runtime->answerNumber<cl_ulong>(CL_DEVICE_QUEUE_PROPERTIES, 3 | cl_ulong{1} << 40);
    runtime->answerNumber<cl_ulong>(CL_DEVICE_HALF_FP_CONFIG, CL_FP_FMA);
    runtime->answerNumber<cl_ulong>(CL_DEVICE_GLOBAL_MEM_SIZE, (cl_ulong{1} << 63) + 1);
    runtime->answerNumber<cl_uint>(CL_DEVICE_GLOBAL_MEM_CACHE_TYPE, CL_READ_ONLY_CACHE);
    runtime->answerNumber<cl_uint>(CL_DEVICE_LOCAL_MEM_TYPE, 77);
    runtime->answerNumber<cl_uint>(CL_DEVICE_IMAGE_SUPPORT, 0);
    runtime->answerText(CL_DEVICE_EXTENSIONS, std::string("cl_one  cl_two\0 cl_gone", 23));
    Json const report = Json::parse(JsonOf(Gather({"opencl"}, drivers)));
    runtime->reset();
    Json const &device = report["opencl"]["platforms"][0]["devices"][0];
    EXPECT_EQ((Json{"CL_QUEUE_OUT_OF_ORDER_EXEC_MODE_ENABLE", "CL_QUEUE_PROFILING_ENABLE",
                    "1099511627776"}),
              device["queue_properties"]);
    EXPECT_EQ(Json::array({"CL_FP_FMA"}), device["half_fp_config"]);
    EXPECT_EQ((cl_ulong{1} << 63) + 1, device["global_mem_size"]["value"].get<cl_ulong>());
    EXPECT_EQ("CL_READ_ONLY_CACHE", device["global_mem_cache_type"]);
    EXPECT_EQ("77", device["local_mem_type"]);
    EXPECT_EQ(false, device["image_support"]);
    EXPECT_EQ((Json{"cl_one", "cl_two"}), device["extensions"]);
}

// Whatever a driver calls itself, its name stays a text.
TEST(ReportTest, EscapesEveryText) {
    std::string const nasty = "</td>\"<b>&amp;' \xC3\xA4 \x80";
    Table const table{{{"column", nasty}}, {{nasty}, {Unavailable{nasty}}, {Names{nasty, nasty}}}};
    Group group{nasty, {}, nasty};
    group.add("text", nasty, Value(nasty));
    group.add("names", nasty, Value(Names(9, nasty)));
    group.add("table", nasty, table);
    group.addDetail("groups", nasty, std::vector<Group>{{nasty, {}, nasty}});
    Report const report = {{"section", group}};

    std::string const page = HtmlOf(report);
    EXPECT_EQ(0u, Occurrences(page, nasty) + Occurrences(page, "<b>"));
    // Titles: of the section, twice, and of what is in it; what is in it; the two failures.
    EXPECT_EQ(2u + 5 + 1 + (1 + 9 + 4) + 2,
              Occurrences(page, "&lt;/td&gt;&quot;&lt;b&gt;&amp;amp;' \xC3\xA4"));
    Json const json = Json::parse(JsonOf(report))["section"];
    std::string const clean = "</td>\"<b>&amp;' \xC3\xA4 \xEF\xBF\xBD";
    EXPECT_EQ(clean, json["text"]);
    EXPECT_EQ(clean, json["table"][1]["column"]["unavailable"]);
}

// One change is told, with its place, and nothing else is.
TEST(ReportTest, DiffTellsEachChange) {
    TemporaryFolder const folder;
    auto const file = [&folder](char const *name, Json const &report) {
        std::string const text = report.dump();
        App::WriteFile(folder.path() / name, {text.begin(), text.end()});
        return folder.path() / name;
    };
    Drivers drivers("");
    Json const report =
        Json::parse(JsonOf(Gather({"library", "displays", "opengl", "opencl"}, drivers)));
    auto const before = file("before.json", report);
    EXPECT_THAT(DiffReports(before, before), testing::IsEmpty());
    unsigned int changes = 0;
    for (Json::json_pointer const &place : Leaves(report)) {
        if (place.to_string().rfind("/oruinfo", 0) == 0)
            continue;
        Json changed = report;
        changed[place] = "changed";
        std::vector<std::string> const lines = DiffReports(before, file("after.json", changed));
        std::string section = place.to_string().substr(1);
        section = section.substr(0, section.find('/')) + ".";
        EXPECT_THAT(lines, testing::SizeIs(testing::AllOf(testing::Ge(1u), testing::Le(2u))))
            << place;
        EXPECT_THAT(lines, testing::Each(testing::StartsWith(section)));
        ++changes;
    }
    EXPECT_GT(changes, 50u);
}
