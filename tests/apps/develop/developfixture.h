// What tests of the program develop share.
#pragma once

#include "apps/common/imagefile.h"
#include "apps/common/pngcodec.h"
#include "apps/common/unicode.h"
#include "tests/support/program.h"

#include <gtest/gtest.h>

namespace apps_test {

inline constexpr App::SizeLimit cLimit = {1000000}; // as much as a PNG has

class DevelopFixture : public ::testing::Test {
protected:
    Outcome develop(std::vector<std::string> const &arguments) {
        return RunProgram("develop.exe", arguments, folder_.path());
    }

    std::filesystem::path path(std::string const &name) const {
        return folder_.path() / App::ToPath(name);
    }

    void write(std::string const &name, std::vector<unsigned char> const &bytes) {
        std::filesystem::create_directories(path(name).parent_path());
        App::WriteFile(path(name), bytes);
    }
    void write(std::string const &name, App::Image const &image) {
        write(name, App::EncodePng(image));
    }

    App::Image read(std::string const &name) const { return App::ReadImage(path(name), cLimit); }

    TemporaryFolder folder_;
};

/// Whether an outcome has an error line that names the file and the reason.
inline testing::AssertionResult Reports(Outcome const &outcome, std::string const &name,
                                        std::string const &reason) {
    for (std::string const &line : outcome.errorLines())
        if (line.find(name + ": ") != std::string::npos && line.find(reason) != std::string::npos)
            return testing::AssertionSuccess();
    return testing::AssertionFailure() << "no line about " << name << ": " << reason << " in\n"
                                       << outcome.errors;
}

} // namespace apps_test
