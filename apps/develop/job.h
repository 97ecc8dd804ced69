// The whole run of develop.
#pragma once

namespace Develop {

struct Options;

/// Develops the photos that the options name.
/// @return the process's exit code: 0, or 1 when a photo or the machine made a problem
int RunJob(Options const &options);

} // namespace Develop
