// Running a program from a test, and a folder for its files.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace apps_test {

struct Outcome {
    int exitCode = -1;
    std::string output;
    std::string errors;

    /// The lines of the error output.
    std::vector<std::string> errorLines() const;
};

/// The folder of the test and of what is built beside it.
std::filesystem::path ProgramFolder();

/// Runs a program that stands beside the test.
/// @param arguments UTF-8
/// @param folder its current folder
Outcome RunProgram(std::string const &name, std::vector<std::string> const &arguments,
                   std::filesystem::path const &folder);

/// An empty folder that goes with all its files.
class TemporaryFolder {
public:
    TemporaryFolder();
    ~TemporaryFolder();
    TemporaryFolder(TemporaryFolder const &) = delete;
    TemporaryFolder &operator=(TemporaryFolder const &) = delete;

    std::filesystem::path const &path() const { return path_; }

    /// Names of the files in a folder of it.
    std::vector<std::string> list(std::string const &subfolder) const;

private:
    std::filesystem::path path_;
};

} // namespace apps_test
