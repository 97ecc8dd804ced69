// What is done for long, and what has to be as it was afterwards.
#pragma once

#include <chrono>
#include <cstddef>
#include <filesystem>
#include <string>
#include <vector>

namespace Soak {

struct Verdict {
    bool passed = false;
    std::string figures; ///< for people, on one line
};

/// Develops photos in this process, all ways to sharpen in turn. The working set stays flat, the
/// handles and the names of OpenGL objects end as they were.
/// @param photos pictures to develop beside the generated ones
Verdict DevelopPhotos(std::size_t count, std::vector<std::filesystem::path> const &photos);

/// Eight threads, each with a context of one share group, make textures and buffers, fill, read,
/// compare and destroy them; every other object is read and destroyed by the next thread.
Verdict ShareObjects(std::chrono::duration<double> time);

/// Makes and destroys contexts, as many by plain calls before, and an eighth of that on windows.
/// The library's leave no handles behind and hold no more memory than the plain ones. Those on
/// windows are not judged by memory: for each the system makes and drops a Direct3D device, which
/// tells the display. To be run first: free memory of other work would hide what is lost.
Verdict MakeContexts(std::size_t count);

} // namespace Soak
