// What the command line of oruinfo asks for.
#pragma once

#include <optional>
#include <string>
#include <vector>

namespace OruInfo {

struct Options {
    bool json = false;
    bool html = false;
    std::vector<std::string> sections; ///< ids, all when it is empty
    std::string output;                ///< file, or empty for the standard output
    std::string openCLFolder;          ///< where OpenCL.dll lies; empty for the system's folder
    std::vector<std::string> diff;     ///< two reports to compare, or none
};

/// Exit codes. Those of a comparison are the usual ones of such programs.
enum ExitCode { EXIT_DONE = 0, EXIT_NOT_WRITTEN = 1, EXIT_DIFFERENT = 1, EXIT_BAD_INPUT = 2 };

/// The options of a command line. Prints help, version, or one line about what is wrong.
/// @param exitCode set when there is nothing to do: 0 after help and version, 2 after a mistake
/// @return nothing when the program is to end
std::optional<Options> ParseOptions(std::vector<std::string> const &arguments, int &exitCode);

} // namespace OruInfo
