// The OpenCL platforms and their devices.
#include "apps/oruinfo/deviceproperties.h"
#include "apps/oruinfo/drivers.h"
#include "apps/oruinfo/failuretext.h"
#include "apps/oruinfo/sections.h"

#include "oru/oru_ocl/platform.h"

namespace OruInfo {

namespace OCL = ORU::OCL;

namespace {

std::string ProfileName(OCL::Enum::Profile profile) {
    return profile == OCL::Enum::PROFILE_FULL       ? "full"
           : profile == OCL::Enum::PROFILE_EMBEDDED ? "embedded"
                                                    : "other";
}

Group DescribeDevice(OCL::Device const &device, std::string const &number) {
    Group group{"Device " + number, {}, {}};
    group.add("number", "Number", number);
    AddDeviceProperties(device, group);
    return group;
}

std::vector<Group> DescribeDevices(OCL::Platform const &platform, std::size_t index) {
    std::vector<Group> groups;
    for (OCL::Device const &device : platform.devices(OCL::Device::TYPE_ALL))
        groups.push_back(
            DescribeDevice(device, std::to_string(index) + "." + std::to_string(groups.size())));
    return groups;
}

Group DescribePlatform(OCL::Platform const &platform, std::size_t index) {
    Group group{"Platform " + std::to_string(index), {}, {}};
    group.add("name", "Name", Told([&] { return Value(platform.name()); }));
    group.add("vendor", "Vendor", Told([&] { return Value(platform.vendor()); }));
    group.add("version", "Version", Told([&] { return Value(platform.version()); }));
    group.add("profile", "Profile", Told([&] { return Value(ProfileName(platform.profile())); }));
    group.add("extensions", "Extensions",
              Told([&] { return Value(Words(platform.extensions())); }));
    group.failure =
        FailureOf([&] { group.add("devices", "Devices", DescribeDevices(platform, index)); });
    return group;
}

} // namespace

void GatherOpenCL(Drivers &drivers, Group &section) {
    drivers.openOpenCL();
    std::vector<Group> platforms;
    for (OCL::Platform const &platform : OCL::platforms())
        platforms.push_back(DescribePlatform(platform, platforms.size()));
    section.add("platforms", "Platforms", platforms);
}

} // namespace OruInfo
