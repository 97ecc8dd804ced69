// What develop prints: lines, problems, and a progress bar on a terminal.
#pragma once

#include <cstddef>
#include <cstdio>
#include <string>

namespace Develop {

/// A text without the drive that ORU_ROOT_DRIVE names: a script that runs on a system without
/// drives put it before absolute paths, and who gave those shall see them again.
std::string WithoutDrive(std::string text);

class Console {
public:
    /// @param quiet whether only problems are printed
    /// @param output where everything else goes
    Console(bool quiet, std::FILE *output);
    ~Console();
    Console(Console const &) = delete;
    Console &operator=(Console const &) = delete;

    /// Prints a line, above the progress bar if there is one.
    void line(std::string const &text);

    /// Prints a line to the error output, which makes `hadProblems` true.
    void problem(std::string const &text);
    bool hadProblems() const { return hadProblems_; }

    /// As `problem`, for what was wished.
    void notice(std::string const &text);

    /// Shows how far the work is, on a terminal.
    /// @param share from 0 to 1
    void progress(double share, std::string const &text);

    /// Takes the progress bar away.
    void endProgress();

private:
    void clearBar();
    void drawBar();

    bool quiet_;
    std::FILE *output_;
    bool hasBar_; ///< whether there may be a progress bar at all
    bool hadProblems_ = false;
    std::string bar_; ///< what is on the terminal's last line, or empty
};

} // namespace Develop
