// Gathers a report.
#include "apps/oruinfo/gather.h"

#include "apps/oruinfo/failuretext.h"
#include "apps/oruinfo/sections.h"

#include <algorithm>

namespace OruInfo {

namespace {

struct Kind {
    char const *id;
    char const *title;
    void (*gather)(Drivers &drivers, Group &section);
};

constexpr Kind kKinds[] = {{"library", "Library and system", GatherLibrary},
                           {"displays", "Displays", GatherDisplays},
                           {"opengl", "OpenGL", GatherOpenGL},
                           {"capabilities", "OpenGL capabilities", GatherCapabilities},
                           {"pixel_formats", "Pixel formats", GatherPixelFormats},
                           {"limits", "OpenGL limits", GatherLimits},
                           {"filtering", "Filtering", GatherFiltering},
                           {"formats", "Internal formats", GatherFormats},
                           {"opencl", "OpenCL", GatherOpenCL},
                           {"sharing", "Sharing between OpenGL and OpenCL", GatherSharing}};

} // namespace

std::vector<std::string> SectionIds() {
    std::vector<std::string> ids;
    for (Kind const &kind : kKinds)
        ids.emplace_back(kind.id);
    return ids;
}

Report Gather(std::vector<std::string> const &ids, Drivers &drivers) {
    Report report;
    for (Kind const &kind : kKinds) {
        if (!ids.empty() && std::find(ids.begin(), ids.end(), kind.id) == ids.end())
            continue;
        Section section{kind.id, {kind.title, {}, {}}};
        section.group.failure = FailureOf([&] { kind.gather(drivers, section.group); });
        report.push_back(std::move(section));
    }
    return report;
}

} // namespace OruInfo
