// The pictures to develop, and the files they become.
#pragma once

#include <filesystem>
#include <functional>
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

/// The pictures of a command line: files as they come, folders as their PNG and JPEG files in the
/// order of their names. A picture whose output another one writes already, or whose output would
/// replace one of the inputs, is a problem and left out.
/// @param alsoRead further files that no output may replace
std::vector<Photo> ListPhotos(std::vector<std::string> const &inputs,
                              std::filesystem::path const &outputFolder,
                              std::vector<std::string> const &alsoRead,
                              ProblemHandler const &onProblem);

} // namespace Develop
