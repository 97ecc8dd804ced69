// What became of the photos of a run.
#pragma once

#include "apps/common/image.h"
#include "apps/develop/photolist.h"

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace Develop {

/// A photo, or an input that could not be used as one.
struct PhotoRecord {
    enum class Status { Cancelled, Developed, Failed, Skipped };

    std::string input;
    std::string output;
    Status status = Status::Cancelled; ///< until it is known
    std::string reason;                ///< of a failure
    std::vector<std::string> notes;
    double milliseconds = 0;
    std::optional<App::Shape> shape; ///< when the photo could be opened
    std::string colourSpace;         ///< of the developed picture
};

struct RunReport {
    std::vector<PhotoRecord> photos;
    std::string problem; ///< what ended the whole run, or empty
    double milliseconds = 0;

    std::size_t count(PhotoRecord::Status status) const;

    /// The whole report for programs.
    std::string json() const;
};

} // namespace Develop
