// What tests of the program develop share.
#pragma once

#include "apps/common/file.h"
#include "apps/common/imagefile.h"
#include "apps/common/unicode.h"
#include "tests/support/pictures.h"
#include "tests/support/program.h"

#include <gmock/gmock.h>

namespace apps_test {

inline constexpr App::SizeLimit kPngLimit = {1000000};

/// A folder of pictures and the program that runs in it.
class DevelopFixture : public ::testing::Test {
protected:
    Outcome develop(std::string const &arguments) {
        return RunProgram("develop.exe", arguments, folder_.path());
    }

    /// Runs the program, which must not complain. @return what it tells
    std::string tellsOf(std::string const &arguments) {
        Outcome const outcome = develop(arguments);
        EXPECT_EQ(outcome.exitCode, 0);
        EXPECT_EQ(outcome.errors, "");
        return outcome.output;
    }

    std::filesystem::path path(std::string const &name) const {
        return folder_.path() / App::ToPath(name);
    }

    void write(std::string const &name, Bytes const &bytes) {
        std::filesystem::create_directories(path(name).parent_path());
        App::WriteFile(path(name), bytes);
    }
    void write(std::string const &name, App::Image const &image) {
        write(name, App::EncodePng(image));
    }
    void write(std::string const &name, std::string const &text) {
        write(name, Bytes(text.begin(), text.end()));
    }

    App::Image read(std::string const &name) const { return App::ReadImage(path(name), kPngLimit); }

    TemporaryFolder folder_;
};

} // namespace apps_test
