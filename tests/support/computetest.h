// What tests of OpenCL objects share: the layer on the tests' runtime, contexts, leak checks.
#pragma once

#include "oru/oru_ocl/commandqueue.h"
#include "oru/oru_ocl/extensionmanagerocl.h"
#include "oru/oru_ocl/programocl.h"
#include "tests/support/failure.h"
#include "tests/support/glfixture.h"
#include "tests/support/testruntime.h"

#include <gtest/gtest.h>

#include <numeric>
#include <string>
#include <vector>

namespace oru_test {

namespace OGL = ORU::OGL;

constexpr auto reads = ORU::OCL::Memory::MEMORY_READ_ONLY;
constexpr auto writes = ORU::OCL::Memory::MEMORY_WRITE_ONLY;
constexpr auto both = ORU::OCL::Memory::MEMORY_READ_WRITE;
constexpr cl_image_format rgba8 = {CL_RGBA, CL_UNORM_INT8};

/// The address of a callback without captures, for the text of a call.
template<class Callback>
void const *AddressOf(Callback const &callback) {
    return reinterpret_cast<void const *>(+callback);
}

/// Every test must leave no handle behind. The layer stays open until the process ends, since only
/// its first opening finds the tests' runtime.
class ComputeTest : public ::testing::Test {
protected:
    ComputeTest() { runtime()->reset(); }

    /// The members of the test are gone here.
    ~ComputeTest() override { EXPECT_EQ(0u, runtime()->liveHandles()); }

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
    ORU::OCL::Program build(std::string const &source, std::string const &options = "") const {
        ORU::OCL::Program program(context, source);
        program.build(options);
        return program;
    }

    /// The kernel `name` of a program, with its first argument.
    template<class T>
    static ORU::OCL::Kernel KernelOf(ORU::OCL::Program const &program, char const *name,
                                     T const &argument) {
        ORU::OCL::Kernel kernel = program.kernel(name);
        kernel.setArg(0, argument);
        return kernel;
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

    ORU::OCL::Context context = makeContext();
    ORU::OCL::CommandQueue queue{context, device(), false, false};
};

/// With an OpenGL context, current.
class SharingTest : public QueueTest {
protected:
    SharingTest() { glContext_.makeCurrent(); }

    void TearDown() override { EXPECT_EQ(GLenum(GL_NO_ERROR), ::glGetError()); }

private:
    OGL::AutoInitializer library_;
    OGL::ContextOffscreen glContext_;
};

/// 0, 1, 2 and so on.
template<class T>
std::vector<T> Counting(std::size_t count) {
    std::vector<T> values(count);
    std::iota(values.begin(), values.end(), T(0));
    return values;
}

} // namespace oru_test
