// What the command line of develop asks for.
#pragma once

#include "apps/common/picture.h"
#include "apps/develop/sharpener.h"

#include <optional>
#include <string>
#include <vector>

namespace Develop {

struct Options {
    std::vector<std::string> inputs; ///< pictures and folders, UTF-8
    std::string list;                ///< file of further ones, "-" for the standard input, or empty
    std::string output = "out";      ///< folder of the developed pictures
    /// Kind of the developed pictures; nothing to keep that of each photo.
    std::optional<App::FileKind> kind = App::FileKind::Png;
    int quality = 90;          ///< of JPEG files
    bool skipExisting = false; ///< whether to leave out what is developed already
    std::string convertTo;     ///< name of a colour space, or empty to keep the photo's
    double exposure = 0;       ///< stops
    Sharpening sharpening;
    std::string openCLFolder; ///< where OpenCL.dll lies; empty for the system's folder
    std::string device;       ///< OpenCL device to sharpen on, see ChooseDeveloper
    std::string spots;        ///< file of local edits, or empty
    std::string base;         ///< the picture developed without the spots, or empty
    bool report = false;      ///< whether to print how each picture was made
    std::string json;         ///< file for what became of the photos, "-" for the standard output
    std::string trace;        ///< file for the OpenGL calls, or empty
    bool quiet = false;
};

/// The options of a command line. Prints help, version, or one line about what is wrong.
/// @param exitCode set when there is nothing to do: 0 after help and version, 2 after a mistake
/// @return nothing when the program is to end
std::optional<Options> ParseOptions(std::vector<std::string> const &arguments, int &exitCode);

} // namespace Develop
