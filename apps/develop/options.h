// What the command line of develop asks for.
#pragma once

#include "apps/develop/sharpener.h"

#include <optional>
#include <string>
#include <vector>

namespace Develop {

struct Options {
    std::vector<std::string> inputs; ///< pictures and folders, UTF-8
    std::string output = "out";      ///< folder of the developed pictures
    double exposure = 0;             ///< stops
    Sharpening sharpening;
    std::string openCLFolder; ///< where OpenCL.dll lies; empty for the system's folder
    std::string device;       ///< OpenCL device to sharpen on, see ChooseSharpener
    std::string spots;        ///< file of local edits, or empty
    std::string base;         ///< the picture developed without the spots, or empty
    bool report = false;      ///< whether to print how each picture was made
    std::string trace;        ///< file for the OpenGL calls, or empty
    bool quiet = false;
};

/// The options of a command line. Prints help, version, or one line about what is wrong.
/// @param exitCode set when there is nothing to do: 0 after help and version, 2 after a mistake
/// @return nothing when the program is to end
std::optional<Options> ParseOptions(std::vector<std::string> const &arguments, int &exitCode);

} // namespace Develop
