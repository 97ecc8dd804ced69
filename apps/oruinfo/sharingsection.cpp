// Whether OpenCL can work on objects of OpenGL.
#include "apps/oruinfo/drivers.h"
#include "apps/oruinfo/failuretext.h"
#include "apps/oruinfo/report.h"
#include "apps/oruinfo/sections.h"

#include "oru/oru_ocl/contextocl.h"

#include <algorithm>

namespace OruInfo {

namespace OCL = ORU::OCL;

namespace {

/// Why a device does not share with an OpenGL context; empty when it does.
std::string WhyNot(OCL::Platform const &platform, OCL::Device const &device,
                   ORU::OGL::Context const &context) {
    if (!device.isSupported(OCL::Enum::EXTENSION_KHR_GL_SHARING))
        return "cl_khr_gl_sharing is not reported";
    OCL::ContextProperties properties(platform);
    properties.setSharedRenderContext(context.renderContext());
    properties.setDisplayContext(context.deviceContext());
    OCL::Context const shared(properties, device);
    return std::string();
}

/// One row for each device of a platform.
void AddDevices(OCL::Platform const &platform, std::size_t index, ORU::OGL::Context const &context,
                Table &table) {
    std::vector<OCL::Device> const devices = platform.devices(OCL::Device::TYPE_ALL);
    for (std::size_t d = 0; d < devices.size(); ++d) {
        std::string why;
        std::string const failure = FailureOf([&] { why = WhyNot(platform, devices[d], context); });
        bool const shares = why.empty() && failure.empty();
        table.rows.push_back({std::to_string(index) + "." + std::to_string(d),
                              Told([&] { return Value(devices[d].name()); }), shares,
                              shares ? Value(Unavailable{}) : Value(why + failure)});
    }
}

bool AnyShares(Table const &devices) {
    return std::any_of(devices.rows.begin(), devices.rows.end(),
                       [](auto const &row) { return std::get<bool>(row[2].content); });
}

} // namespace

void GatherSharing(Drivers &drivers, Group &section) {
    Table devices{
        {{"number", "Device"}, {"name", "Name"}, {"is_possible", "Shares"}, {"why_not", "Why not"}},
        {}};
    std::string why = FailureOf([&] { drivers.openGL(); });
    if (!why.empty())
        why = "there is no OpenGL: " + why;
    else if (why = FailureOf([&] { drivers.openOpenCL(); }); !why.empty())
        why = "there is no OpenCL: " + why;
    if (why.empty()) {
        std::vector<OCL::Platform> const platforms = OCL::platforms();
        for (std::size_t p = 0; p < platforms.size(); ++p) {
            std::string const failure =
                FailureOf([&] { AddDevices(platforms[p], p, drivers.openGL(), devices); });
            if (!failure.empty())
                why += (why.empty() ? "" : "; ") + platforms[p].name() + ": " + failure;
        }
        if (why.empty())
            why = "no device shares";
    }
    bool const isPossible = AnyShares(devices);
    section.add("is_possible", "Possible", isPossible);
    section.add("why_not", "Why not", isPossible ? Value(Unavailable{}) : Value(why));
    section.add("devices", "Devices", devices);
}

} // namespace OruInfo
