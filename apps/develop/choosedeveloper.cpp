// Which way to develop on this machine.
#include "apps/develop/choosedeveloper.h"

#include "apps/common/failure.h"
#include "apps/common/unicode.h"
#include "apps/develop/glslsharpener.h"
#include "apps/develop/opencldeveloper.h"
#include "apps/develop/openclruntime.h"
#include "apps/develop/openclsharpener.h"
#include "apps/develop/opengldeveloper.h"

#include "oru/core/exceptions/logicalexception.h"

#include <algorithm>

namespace Develop {

namespace OCL = ORU::OCL;

namespace {

bool Shares(OpenCLDevice const &device) {
    return device.device.isSupported(OCL::Enum::EXTENSION_KHR_GL_SHARING) &&
           device.device.supportsImages();
}

/// Lower is better.
int Rank(OpenCLDevice const &device) {
    return Shares(device) ? 0 : device.device.type() & OCL::Device::TYPE_GPU ? 1 : 2;
}

/// Whether the wish is the device's numbers or a part of its names.
bool IsWished(OpenCLDevice const &device, std::string const &wish) {
    std::size_t const numbers = device.name.find(' ');
    return device.name.substr(0, numbers) == wish ||
           App::FoldCase(device.name.substr(numbers)).find(App::FoldCase(wish)) !=
               std::string::npos;
}

void KeepWished(std::vector<OpenCLDevice> &devices, std::string const &wish) {
    std::string names;
    for (OpenCLDevice const &device : devices)
        names += (names.empty() ? "" : ", ") + device.name;
    devices.erase(
        std::remove_if(devices.begin(), devices.end(),
                       [&wish](OpenCLDevice const &device) { return !IsWished(device, wish); }),
        devices.end());
    if (devices.empty())
        throw App::Failure("there is no OpenCL device '" + wish + "'; there is " +
                           (names.empty() ? std::string("none") : names));
}

std::unique_ptr<Developer> MakeOpenCLDeveloper(OpenCLDevice const &device,
                                               ORU::OGL::Context const &context) {
    if (Shares(device)) {
        try {
            return std::make_unique<OpenGLDeveloper>(
                std::make_unique<OpenCLSharpener>(device, context));
        } catch (ORU::LogicalException const &) {
            // It shares with other contexts than this one: a GPU beside the one that draws, say.
        }
    }
    return std::make_unique<OpenCLDeveloper>(device);
}

std::unique_ptr<Developer> MakeGlslDeveloper(std::string const &reason) {
    return std::make_unique<OpenGLDeveloper>(std::make_unique<GlslSharpener>(reason));
}

} // namespace

std::unique_ptr<Developer> ChooseDeveloper(OpenCLRuntime const &runtime, std::string const &wish,
                                           ORU::OGL::Context const &context) {
    if (wish == "none")
        return MakeGlslDeveloper("as wished");
    std::vector<OpenCLDevice> devices = runtime.devices();
    if (!wish.empty())
        KeepWished(devices, wish);
    if (devices.empty())
        return MakeGlslDeveloper(runtime.isAvailable() ? "no OpenCL device" : "no OpenCL runtime");
    auto const best = std::min_element(
        devices.begin(), devices.end(),
        [](OpenCLDevice const &a, OpenCLDevice const &b) { return Rank(a) < Rank(b); });
    return MakeOpenCLDeveloper(*best, context);
}

} // namespace Develop
