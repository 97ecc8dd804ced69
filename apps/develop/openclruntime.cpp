// The OpenCL runtime of this machine, if it has one.
#include "apps/develop/openclruntime.h"

#include "oru/core/exceptions/logicalexception.h"
#include "oru/oru_ocl/ocllibrary.h"
#include "oru/oru_ocl/platform.h"

namespace Develop {

namespace OCL = ORU::OCL;

OpenCLRuntime::OpenCLRuntime() {
    if (!OCL::Library::IsOpenCLAvailable(std::string()))
        return;
    try {
        library_ = std::make_unique<OCL::AutoInitializer>();
    } catch (ORU::LogicalException const &) {
        // A runtime that cannot be used is as good as none.
    }
}

OpenCLRuntime::~OpenCLRuntime() = default;
OpenCLRuntime::OpenCLRuntime(OpenCLRuntime &&) noexcept = default;
OpenCLRuntime &OpenCLRuntime::operator=(OpenCLRuntime &&) noexcept = default;

std::string OpenCLRuntime::description() const {
    if (!isAvailable())
        return "no OpenCL runtime";
    std::string names;
    for (OCL::Platform const &platform : OCL::platforms())
        names += (names.empty() ? "OpenCL by " : ", ") + platform.name();
    return names;
}

} // namespace Develop
