// The OpenCL runtime of this machine, if it has one, and its devices.
#include "apps/develop/openclruntime.h"

#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ocl/ocllibrary.h"

#include <exception>

namespace Develop {

namespace OCL = ORU::OCL;

namespace {

/// The layer takes a directory only with the separator at its end.
std::string Directory(std::string const &folder) {
    bool const complete = folder.empty() || folder.back() == '/' || folder.back() == '\\';
    return complete ? folder : folder + "\\";
}

} // namespace

OpenCLRuntime::OpenCLRuntime(std::string const &folder) {
    if (!OCL::Library::IsOpenCLAvailable(Directory(folder)))
        return;
    try {
        library_ = std::make_unique<OCL::AutoInitializer>();
    } catch (std::exception const &) {
        // A runtime that cannot be used is as good as none.
    }
}

OpenCLRuntime::~OpenCLRuntime() = default;

std::string OpenCLRuntime::description() const {
    if (!isAvailable())
        return "no OpenCL runtime";
    std::string names;
    for (OCL::Platform const &platform : OCL::platforms())
        names += (names.empty() ? "OpenCL by " : ", ") + platform.name();
    return names;
}

std::vector<OpenCLDevice> OpenCLRuntime::devices() const {
    std::vector<OpenCLDevice> found;
    if (!isAvailable())
        return found;
    std::vector<OCL::Platform> const platforms = OCL::platforms();
    for (std::size_t p = 0; p < platforms.size(); ++p) {
        std::vector<OCL::Device> devices;
        try {
            devices = platforms[p].devices(OCL::Device::TYPE_ALL);
        } catch (OCL::ExceptionOCL const &) {
            // A platform without devices.
        }
        for (std::size_t d = 0; d < devices.size(); ++d)
            found.push_back({platforms[p], devices[d],
                             std::to_string(p) + "." + std::to_string(d) + " " + devices[d].name() +
                                 " (" + platforms[p].name() + ")"});
    }
    return found;
}

} // namespace Develop
