// What develop prints: lines, problems, and a progress bar on a terminal.
#pragma once

#include <cstddef>
#include <string>

namespace Develop {

class Console {
public:
    /// @param quiet whether only problems are printed
    explicit Console(bool quiet);
    ~Console();
    Console(Console const &) = delete;
    Console &operator=(Console const &) = delete;

    /// Prints a line, above the progress bar if there is one.
    void line(std::string const &text);

    /// Prints a line to the error output, which makes `hadProblems` true.
    void problem(std::string const &name, std::string const &reason);
    bool hadProblems() const { return hadProblems_; }

    /// Shows how far the work is, on a terminal and when there is more than one thing to do.
    /// @param current what is being worked on
    void progress(std::size_t done, std::size_t total, std::string const &current);

private:
    void clearBar();
    void drawBar();

    bool quiet_;
    bool hasBar_; ///< whether there may be a progress bar at all
    bool hadProblems_ = false;
    std::string bar_; ///< what is on the terminal's last line, or empty
};

} // namespace Develop
