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

/// What `getInfo` of a memory object answers.
template<class T, class Object, class Query>
T Get(Object const &object, Query query) {
    T value{};
    std::size_t size = 0;
    object.getInfo(query, sizeof value, &value, &size);
    EXPECT_EQ(sizeof value, size);
    return value;
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

    static ORU::OCL::Platform platform() {
        runtime(); // opens the layer, also for what is made before the fixture
        return ORU::OCL::platforms().front();
    }
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
    explicit QueueTest(ORU::OCL::Context const &made = makeContext())
        : context(made), queue(context, device(), false, false) {}

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

    ORU::OCL::Context context;
    ORU::OCL::CommandQueue queue;
};

/// An OpenGL context, current. A base, so that it is there before the OpenCL context.
class WithGLContext {
protected:
    WithGLContext() { glContext.makeCurrent(); }

private:
    OGL::AutoInitializer library_;

protected:
    OGL::ContextOffscreen glContext;
};

/// An OpenCL context that shares the objects of the current OpenGL context.
class SharingTest : protected WithGLContext, public QueueTest {
protected:
    SharingTest() : QueueTest(ORU::OCL::Context(propertiesToShare(), device())) {}

    void TearDown() override { EXPECT_EQ(GLenum(GL_NO_ERROR), ::glGetError()); }

    ORU::OCL::ContextProperties propertiesToShare() const {
        ORU::OCL::ContextProperties properties(platform());
        properties.setSharedRenderContext(glContext.renderContext());
        properties.setDisplayContext(glContext.deviceContext());
        return properties;
    }
};

/// 0, 1, 2 and so on.
template<class T>
std::vector<T> Counting(std::size_t count) {
    std::vector<T> values(count);
    std::iota(values.begin(), values.end(), T(0));
    return values;
}

} // namespace oru_test
