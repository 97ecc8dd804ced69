// The code of the page for those who come from the C++ bindings of OpenCL.
#define CL_TARGET_OPENCL_VERSION 110
#define CL_HPP_TARGET_OPENCL_VERSION 110
#define CL_HPP_MINIMUM_OPENCL_VERSION 110
#define CL_HPP_ENABLE_EXCEPTIONS
#include <CL/opencl.hpp>

#include "oru/oru_ocl/commandqueue.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ocl/ocllibrary.h"
#include "oru/oru_ocl/programocl.h"

#include <gtest/gtest.h>

#include <iostream>
#include <string>
#include <vector>

namespace {

std::string const kSource = "kernel void brighten(global float *values, float factor) {"
                            "    values[get_global_id(0)] *= factor;"
                            "}";

namespace bindings {

// [bindings]
void brighten(std::vector<float> &values, float factor) {
    std::vector<cl::Platform> platforms;
    cl::Platform::get(&platforms);
    std::vector<cl::Device> devices;
    platforms.front().getDevices(CL_DEVICE_TYPE_ALL, &devices);
    cl::Device const device = devices.front();
    cl::Context const context(device);
    cl::CommandQueue const queue(context, device);

    std::size_t const bytes = values.size() * sizeof(float);
    cl::Buffer const buffer(context, CL_MEM_READ_WRITE | CL_MEM_COPY_HOST_PTR, bytes,
                            values.data());
    cl::Program program(context, kSource);
    try {
        program.build("");
    } catch (cl::BuildError const &failure) {
        for (auto const &log : failure.getBuildLog())
            std::cerr << log.second;
        throw;
    }
    cl::Kernel kernel(program, "brighten");
    kernel.setArg(0, buffer);
    kernel.setArg(1, factor);
    queue.enqueueNDRangeKernel(kernel, cl::NullRange, cl::NDRange(values.size()));
    queue.enqueueReadBuffer(buffer, CL_TRUE, 0, bytes, values.data());
}
// [bindings]

} // namespace bindings

namespace layer {

using namespace ORU::OCL;

// [layer]
void brighten(std::vector<float> &values, float factor) {
    Platform const platform = platforms().front();
    Device const device = platform.devices(Device::TYPE_ALL).front();
    Context const context(ContextProperties(platform), device);
    CommandQueue queue(context, device, false, false);

    std::size_t const bytes = values.size() * sizeof(float);
    Buffer const buffer(context, Memory::MEMORY_READ_WRITE, false, bytes, values.data());
    Program program(context, kSource);
    try {
        program.build("");
    } catch (ExceptionOCL const &) {
        std::cerr << program.buildLog(device);
        throw;
    }
    Kernel kernel = program.kernel("brighten");
    kernel.setArg(0, buffer);
    kernel.setArg(1, factor);
    queue.enqueueKernel(kernel, Range<1>(values.size()), 0, 0);
    queue.enqueueBlockingRead(buffer, 0, bytes, values.data());
}
// [layer]

} // namespace layer

} // namespace

TEST(ComingFromOpenCL, DoesTheSameBothWays) {
    ORU::OCL::AutoInitializer const library;
    std::vector<float> ours = {1, 2, 3}, theirs = ours;
    bindings::brighten(theirs, 2);
    layer::brighten(ours, 2);
    EXPECT_EQ(theirs, ours);
    EXPECT_EQ(6, ours[2]);
}

TEST(ComingFromOpenCL, SharesHandles) {
    using namespace ORU::OCL;
    AutoInitializer const library;
    Device const device = platforms().front().devices(Device::TYPE_ALL).front();
    Context const context(ContextProperties(device.platform()), device);
    // [handles]
    cl::CommandQueue const theirs(cl::Context(context.id(), true), cl::Device(device.id()));
    CommandQueue queue(theirs(), add_ref_tag()); // the same queue, with a reference of its own
    // [handles]
    float value = 1;
    Buffer buffer(context, Memory::MEMORY_READ_WRITE, false, sizeof value);
    queue.enqueueWrite(buffer, 0, sizeof value, &value);
    float read = 0;
    theirs.enqueueReadBuffer(cl::Buffer(buffer.id(), true), CL_TRUE, 0, sizeof read, &read);
    EXPECT_EQ(value, read);
}
