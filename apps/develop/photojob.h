// One photo through all stages, from its file to the developed one.
#pragma once

#include "apps/common/image.h"
#include "apps/develop/developer.h"

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

namespace Develop {

/// What happened to a photo, for people.
using ReportLines = std::vector<std::string>;

class PhotoJob {
public:
    /// @param base the picture developed without the recipe's spots, of which only what these can
    ///        change is computed; empty to compute all
    /// @param withReport whether to measure each stage
    PhotoJob(Developer &developer, Recipe const &recipe, App::SizeLimit limit,
             std::filesystem::path const &base, bool withReport);

    /// Reads, develops and writes a photo.
    /// @return the report, empty when none is wanted
    /// @throws Failure, ORU::LogicalException when something fails; nothing is written then
    ReportLines run(std::filesystem::path const &input, std::filesystem::path const &output);

private:
    App::Image readBase(App::Shape const &photo) const;
    App::Image developLocally(App::Image const &photo, App::Image base, ReportLines &report);

    Developer &developer_;
    Recipe const &recipe_;
    App::SizeLimit limit_;
    std::filesystem::path base_;
    bool withReport_;
};

} // namespace Develop
