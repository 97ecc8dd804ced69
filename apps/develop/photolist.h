// The pictures to develop, and the files they become.
#pragma once

#include "apps/common/picture.h"

#include <filesystem>
#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace Develop {

struct Photo {
    std::filesystem::path input;
    std::filesystem::path output;

    std::string name() const; ///< the input as a person gave it, UTF-8
};

/// Told of an input that cannot be used: its name and the reason.
using ProblemHandler = std::function<void(std::string const &name, std::string const &reason)>;

/// The lines of a list of pictures and folders; empty ones are left out.
/// @param file "-" for the standard input
/// @throws Failure when it cannot be read or is no list
std::vector<std::string> ReadList(std::string const &file);

/// The pictures of a command line: files as they come, folders as their picture files in the order
/// of their names. A picture whose output another one writes already, or whose output would replace
/// one of the inputs, is a problem and left out.
/// @param kind of the outputs; nothing for that of each input, told by its name, PNG for others
/// @param alsoRead further files that no output may replace
std::vector<Photo> ListPhotos(std::vector<std::string> const &inputs,
                              std::filesystem::path const &outputFolder,
                              std::optional<App::FileKind> kind,
                              std::vector<std::string> const &alsoRead,
                              ProblemHandler const &onProblem);

} // namespace Develop
