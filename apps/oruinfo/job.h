// The whole run of oruinfo.
#pragma once

namespace OruInfo {

struct Options;

/// Writes a report, or what changed between two. Problems are a line on the standard error.
/// @return the exit code
int RunJob(Options const &options);

} // namespace OruInfo
