// What tests of OpenCL objects share: the layer on the tests' runtime, contexts, leak checks.
#pragma once

#include "oru/oru_ocl/commandqueue.h"
#include "oru/oru_ocl/extensionmanagerocl.h"
#include "oru/oru_ocl/programocl.h"
#include "tests/support/failure.h"
#include "tests/support/testruntime.h"

#include <gtest/gtest.h>

namespace oru_test {

constexpr auto kReads = ORU::OCL::Memory::MEMORY_READ_ONLY;
constexpr auto kWrites = ORU::OCL::Memory::MEMORY_WRITE_ONLY;
constexpr auto kBoth = ORU::OCL::Memory::MEMORY_READ_WRITE;
constexpr cl_image_format kRGBA8 = {CL_RGBA, CL_UNORM_INT8};

/// A null argument, as the call book shows it.
constexpr void *kNone = nullptr;

/// Every test must leave no handle behind. The layer stays open until the process ends, since only
/// its first opening finds the tests' runtime.
class ComputeTest : public ::testing::Test {
protected:
    /// The members of the test are gone here.
    ~ComputeTest() override {
        EXPECT_TRUE(runtime->references().empty());
        runtime->reset();
    }

    static TestRuntime const &OpenRuntime() {
        static TestRuntime const kRuntime("ocl_runtime");
        EXPECT_TRUE(ORU::OCL::Library::IsOpenCLAvailable(kRuntime.folder()));
        ORU::OCL::Library::InitializeIfNecessary();
        return kRuntime;
    }

    TestRuntime const &runtime = OpenRuntime();
    ORU::OCL::Platform const platform = ORU::OCL::platforms().front();
    ORU::OCL::Device const device = platform.devices(ORU::OCL::Device::TYPE_ALL).front();
};

/// A test with a context and an in-order queue.
class QueueTest : public ComputeTest {
protected:
    ORU::OCL::Program built(std::string const &source) const {
        ORU::OCL::Program program(context, source);
        program.build("");
        return program;
    }

    ORU::OCL::Context context{ORU::OCL::ContextProperties(platform), device};
    ORU::OCL::CommandQueue queue{context, device, false, false};
};

} // namespace oru_test
