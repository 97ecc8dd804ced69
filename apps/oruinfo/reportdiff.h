// What changed between two reports.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace OruInfo {

/// Compares two reports in JSON: one line for each value that differs, with its path, and for each
/// name that a list has only once. Rows of tables are the same row when their first field is.
/// @throws App::Failure for a file that is none, with the file's name
std::vector<std::string> DiffReports(std::filesystem::path const &before,
                                     std::filesystem::path const &after);

} // namespace OruInfo
