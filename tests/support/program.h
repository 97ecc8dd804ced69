// Running a program from a test, and the files that it works on.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace apps_test {

using Bytes = std::vector<unsigned char>;

/// A picture of tests/apps/common/data, of a kind that the programs read but do not write.
Bytes Foreign(std::string const &name);

/// The folder of the test and of what is built beside it.
std::filesystem::path ProgramFolder();

/// A program that stands beside the test, running. What still runs when its owner goes is ended.
class Process {
public:
    /// @param arguments as on a command line, in UTF-8
    /// @param output, errors handles of its standard streams, if it is to have them
    Process(std::string const &name, std::string const &arguments,
            std::filesystem::path const &folder, void *output = nullptr, void *errors = nullptr);
    ~Process();
    Process(Process const &) = delete;
    Process &operator=(Process const &) = delete;

    /// Waits for its end. @return its exit code, -1 when it never began or goes on for minutes
    int exitCode() const;

    /// Does to it what a console does when Ctrl-C is pressed.
    void pressControlC() const;

private:
    void *handle_;
};

struct Outcome {
    int exitCode;
    std::string output;
    std::string errors;
};

/// Runs a program to its end.
Outcome RunProgram(std::string const &name, std::string const &arguments,
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
