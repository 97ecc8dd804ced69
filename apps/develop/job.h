// The whole run of develop.
#pragma once

namespace Develop {

struct Options;

/// Develops the photos that the options name.
/// @return the process's exit code: 0, 1 when a photo or the machine made a problem, 130 when it
/// was
///         cancelled
int RunJob(Options const &options);

} // namespace Develop
