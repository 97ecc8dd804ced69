// OpenCL programs: what is built for a device from source or binaries.
#include "oru/oru_ocl/programocl.h"

#include "oru/core/utility/composetext.h"
#include "oru/core/utility/enumtable.h"
#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ocl/internal/handlearray.h"
#include "oru/oru_ocl/internal/infoquery.h"

#include <cstring>

namespace ORU::OCL {

namespace {

constexpr EnumTable<Program::BuildStatus, int, 4> kBuildStatuses = {
    {{Program::BUILD_STATUS_NONE, CL_BUILD_NONE},
     {Program::BUILD_STATUS_ERROR, CL_BUILD_ERROR},
     {Program::BUILD_STATUS_SUCCESS, CL_BUILD_SUCCESS},
     {Program::BUILD_STATUS_IN_PROGRESS, CL_BUILD_IN_PROGRESS}}};
static_assert(kBuildStatuses.isInOrder());

cl_program CreateWithSource(Context const &context, char const *source) {
    std::size_t const length = std::strlen(source);
    return ORU_CL(CreateProgramWithSource, context.id(), 1, &source, &length);
}

cl_program CreateWithBinaries(Context const &context, Program::BinaryArray const &array) {
    std::vector<unsigned char const *> binaries = array.binaries();
    return ORU_CL(CreateProgramWithBinary, context.id(), static_cast<cl_uint>(array.nBinary()),
                  array.devices().data(), array.sizes(), binaries.data(), nullptr);
}

Context ContextOf(cl_program program) {
    cl_context context = nullptr;
    ORU_CL(GetProgramInfo, program, CL_PROGRAM_CONTEXT, sizeof context, &context, nullptr);
    return {context, add_ref_tag()};
}

} // namespace

Program::Program(Context const &context, std::string const &source)
    : context_(context), source_(source) {
    adopt(CreateWithSource(context, source_.c_str()));
}

Program::Program(Context const &context, BinaryArray const &binaries) : context_(context) {
    adopt(CreateWithBinaries(context, binaries));
}

Program::Program(cl_program handle, take_ref_tag const &) : context_(ContextOf(handle)) {
    adopt(handle);
}

Program::Program(cl_program handle, add_ref_tag const &) : context_(ContextOf(handle)) {
    adopt(handle);
    retain();
}

void Program::build(std::string const &options) {
    build(context_.devices(), options);
}

void Program::build(std::vector<Device> const &devices, std::string const &options) {
    build(devices, options, {});
}

void Program::buildAsync(std::vector<Device> const &devices, std::string const &options,
                         NotifyCallback const &callback) {
    build(devices, options, callback);
}

void Program::build(std::vector<Device> const &devices, std::string const &options,
                    NotifyCallback const &callback) {
    HandleArray<cl_device_id> const ids(devices);
    ORU_CL(BuildProgram, id(), ids.count(), ids.data(), options.empty() ? nullptr : options.c_str(),
           callback.pf_notify(), callback.user_data());
}

std::string Program::buildLog(Device const &device) {
    return QueryText([&](std::size_t bytes, void *value, std::size_t *bytesReturned) {
        ORU_CL(GetProgramBuildInfo, id(), device.id(), CL_PROGRAM_BUILD_LOG, bytes, value,
               bytesReturned);
    });
}

Program::BuildStatus Program::buildStatus(Device const &device) {
    std::vector<cl_build_status> const status =
        QueryList<cl_build_status>([&](std::size_t bytes, void *value, std::size_t *bytesReturned) {
            ORU_CL(GetProgramBuildInfo, id(), device.id(), CL_PROGRAM_BUILD_STATUS, bytes, value,
                   bytesReturned);
        });
    return status.empty() ? BUILD_STATUS_NONE : OCLBuildStatus(status.front());
}

Kernel Program::kernel(std::string const &name) const {
    return Kernel(ORU_CL(CreateKernel, id(), name.c_str()));
}

std::vector<Kernel> Program::kernels() const {
    std::vector<Kernel> kernels;
    auto const handles =
        QueryHandles<cl_kernel>([&](cl_uint count, cl_kernel *created, cl_uint *found) {
            // Room before the references exist: nothing may fail once there is something to leak.
            kernels.reserve(count);
            ORU_CL(CreateKernelsInProgram, id(), count, created, found);
        });
    for (cl_kernel const handle : handles)
        kernels.push_back(Kernel(handle));
    return kernels;
}

Program::BuildStatus Program::OCLBuildStatus(int status) {
    return kBuildStatuses.valueOr(status, BUILD_STATUS_NONE);
}

int Program::OpenCLBuildStatus(BuildStatus status) {
    return kBuildStatuses.constantOr(status, CL_BUILD_NONE);
}

Program::BinaryArray::BinaryArray(std::vector<Device> const &devices,
                                  std::vector<std::size_t> const &sizes,
                                  std::vector<std::vector<unsigned char>> const &binaries)
    : sizes_(sizes), binaries_(binaries) {
    devices_.reserve(devices.size());
    for (Device const &device : devices)
        devices_.push_back(device.id());
    ORU_ASSERT_TEXT("devs.size() == sizes.size()", devices.size() == sizes.size());
    ORU_ASSERT(sizes.size() == binaries.size());
    for (std::size_t i = 0; i < sizes.size(); ++i) // the runtime would read behind its end
        if (sizes[i] > binaries[i].size())
            ORU_THROW_INTERNAL("Program::BinaryArray binary ", i, " holds ", binaries[i].size(),
                               " bytes, not the ", sizes[i], " given as its size");
}

Program::BinaryArray::BinaryArray(std::vector<cl_device_id> const &devices,
                                  std::size_t const *sizes, unsigned char const **binaries)
    : devices_(devices), sizes_(sizes, sizes + devices.size()) {
    for (std::size_t i = 0; i < devices.size(); ++i)
        binaries_.emplace_back(binaries[i], binaries[i] + sizes[i]);
}

std::vector<unsigned char const *> Program::BinaryArray::binaries() const {
    std::vector<unsigned char const *> pointers;
    pointers.reserve(binaries_.size());
    for (std::vector<unsigned char> const &binary : binaries_)
        pointers.push_back(binary.data());
    return pointers;
}

} // namespace ORU::OCL
