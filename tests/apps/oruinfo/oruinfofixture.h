// What tests of the program oruinfo share.
#pragma once

#include "apps/common/file.h"
#include "apps/common/unicode.h"
#include "tests/apps/oruinfo/schema.h"
#include "tests/support/program.h"

#include <gmock/gmock.h>

namespace apps_test {

/// The program, and a folder that it runs in.
class OruInfoFixture : public ::testing::Test {
protected:
    Outcome oruinfo(std::string const &arguments) {
        return RunProgram("oruinfo.exe", arguments, folder_.path());
    }

    /// What it writes; it must succeed.
    std::string textOf(std::string const &arguments) {
        Outcome const outcome = oruinfo(arguments);
        EXPECT_EQ(outcome.exitCode, 0) << outcome.errors;
        return outcome.output;
    }

    /// Its report, which must be as the schema says.
    Json reportOf(std::string const &arguments) {
        Json const report = Json::parse(textOf("--json " + arguments));
        Schema schema(Json::parse(App::ReadText(ORU_REPORT_SCHEMA)));
        EXPECT_THAT(schema.problems(report), testing::IsEmpty());
        return report;
    }

    void write(std::string const &name, std::string const &text) {
        App::WriteFile(folder_.path() / name, {text.begin(), text.end()});
    }

    TemporaryFolder folder_;
};

inline std::string RuntimeFolder(std::string const &name) {
    return "--opencl \"" + App::ToText(ProgramFolder() / name) + "\" ";
}

inline std::vector<std::string> NamesIn(Json const &object) {
    std::vector<std::string> names;
    for (auto const &[name, field] : object.items())
        names.push_back(name);
    return names;
}

/// The row of a table whose first field has this value.
inline Json Row(Json const &table, std::string const &name) {
    for (Json const &row : table)
        if (row.front() == name)
            return row;
    return {{"no row", name}};
}

} // namespace apps_test
