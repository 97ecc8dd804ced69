// What tests of OpenCL objects share: the layer on the tests' runtime, a context, memory checks.
#pragma once

#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ocl/commandqueue.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ocl/extensionmanagerocl.h"
#include "oru/oru_ocl/programocl.h"
#include "tests/oru_ocl/testruntime.h"

#include <gtest/gtest.h>

#include <numeric>
#include <string>
#include <vector>

namespace oru_test {

/// The message of the InternalException that `call` throws.
template<class Call>
std::string InternalMessage(Call call) {
    try {
        call();
    } catch (ORU::InternalException const &e) {
        return e.message();
    }
    return "nothing was thrown";
}

/// The code of the ExceptionOCL that `call` throws; CL_SUCCESS when it throws none.
template<class Call>
int ErrorCode(Call call) {
    try {
        call();
    } catch (ORU::OCL::ExceptionOCL const &e) {
        return static_cast<int>(e.errorNumber());
    }
    return CL_SUCCESS;
}

/// Every test must leave no handle behind. The layer stays open until the process ends, since only
/// its first opening finds the tests' runtime.
class ComputeTest : public ::testing::Test {
protected:
    ComputeTest() { runtime()->reset(); }

    void TearDown() override { EXPECT_EQ(0u, runtime()->liveHandles()); }

    static TestRuntime &runtime() {
        static TestRuntime instance = [] {
            TestRuntime loaded("ocl_runtime");
            EXPECT_TRUE(ORU::OCL::Library::IsOpenCLAvailable(loaded.folder()));
            ORU::OCL::Library::Initialize();
            return loaded;
        }();
        return instance;
    }

    static ORU::OCL::Platform platform() { return ORU::OCL::platforms().front(); }
    static ORU::OCL::Device device() {
        return platform().devices(ORU::OCL::Device::TYPE_ALL).front();
    }
    static ORU::OCL::Context makeContext() {
        return ORU::OCL::Context(ORU::OCL::ContextProperties(platform()), device());
    }
};

/// A test with a context and an in-order queue.
class QueueTest : public ComputeTest {
protected:
    QueueTest() : context(makeContext()), queue(context, device(), false, false) {}

    void TearDown() override {
        // The members go after TearDown: what is left then are their two handles.
        EXPECT_EQ(2u, runtime()->liveHandles());
    }

    ORU::OCL::Program build(std::string const &source, std::string const &options = "") const {
        ORU::OCL::Program program(context, source);
        program.build(options);
        return program;
    }

    template<class T>
    ORU::OCL::Buffer bufferOf(std::vector<T> &values) const {
        return ORU::OCL::Buffer(context, ORU::OCL::Memory::MEMORY_READ_WRITE, false,
                                values.size() * sizeof(T), values.data());
    }

    template<class T>
    std::vector<T> contents(ORU::OCL::Buffer const &buffer, std::size_t count) {
        std::vector<T> values(count);
        queue.enqueueBlockingRead(buffer, 0, count * sizeof(T), values.data());
        return values;
    }

    ORU::OCL::Context context;
    ORU::OCL::CommandQueue queue;
};

/// 0, 1, 2 and so on.
template<class T>
std::vector<T> Counting(std::size_t count) {
    std::vector<T> values(count);
    std::iota(values.begin(), values.end(), T(0));
    return values;
}

} // namespace oru_test
