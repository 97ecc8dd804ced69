// The code of the chapter on OpenCL.
#include "oru/core/math/tvec4.h"
#include "oru/core/utility/integerrect.h"
#include "oru/oru_ocl/commandqueue.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ocl/ocllibrary.h"
#include "oru/oru_ocl/programocl.h"
#include "oru/oru_ocl/sampler.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/platformgl.h"
#include "tests/support/testruntime.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <iostream>
#include <numeric>
#include <vector>

using namespace ORU::OCL;

namespace {

/// A context on the first device, as most snippets take it for granted.
class OpenCLGuide : public ::testing::Test {
protected:
    AutoInitializer layer_;

    Device device = platforms().front().devices(Device::TYPE_ALL).front();
    Context context{ContextProperties(platforms().front()), device};
    CommandQueue queue{context, device, false, false};

    Program built(char const *source) const {
        Program program(context, source);
        program.build("");
        return program;
    }
};

/// Starts with the runtime's place, so that a runtime of the tests that can share may stand in.
class OpenCLSharingGuide : public ::testing::Test {
protected:
    OpenCLSharingGuide() {
        static_cast<void>(
            Library::IsOpenCLAvailable(oru_test::TestRuntime("ocl_runtime").folder()));
    }
};

} // namespace

TEST(OpenCLGuideStart, Loads) {
    // [load]
    if (!Library::IsOpenCLAvailable("")) {
        std::cout << "no OpenCL runtime here: the pictures are developed without it\n";
        return;
    }
    AutoInitializer openCL;
    for (Platform const &platform : platforms()) {
        std::cout << platform.name() << ", " << platform.version() << '\n';
        for (Device const &device : platform.devices(Device::TYPE_ALL))
            std::cout << "  " << device.name() << ": "
                      << device.getInfo<unsigned int>(Enum::DEVICEPROPERTY_MAX_COMPUTE_UNITS)
                      << " units, "
                      << device.getInfo<std::uint64_t>(Enum::DEVICEPROPERTY_GLOBAL_MEM_SIZE)
                      << " bytes, driver "
                      << device.getInfo<std::string>(Enum::DEVICEPROPERTY_DRIVER_VERSION) << '\n';
    }
    // [load]
}

TEST(OpenCLGuideStart, RunsAKernel) {
    AutoInitializer openCL;
    // [first]
    Platform const platform = platforms().front();
    Device const device = platform.devices(Device::TYPE_ALL).front();
    Context const context(ContextProperties(platform), device);
    CommandQueue queue(context, device, false, false); // in order, without profiling

    std::vector<float> values(1000);
    std::iota(values.begin(), values.end(), 0.0f);
    std::size_t const bytes = values.size() * sizeof(float);
    Buffer const buffer(context, Memory::MEMORY_READ_WRITE, false, bytes, values.data());

    Program program(context, R"(
        kernel void brighten(global float *values, float factor) {
            values[get_global_id(0)] *= factor;
        })");
    program.build("-cl-fast-relaxed-math");
    Kernel brighten = program.kernel("brighten");
    brighten.setArg(0, buffer);
    brighten.setArg(1, 2.0f);

    queue.enqueueKernel(brighten, Range<1>(values.size()), 0, 0);
    queue.enqueueBlockingRead(buffer, 0, bytes, values.data());
    // [first]
    for (std::size_t i = 0; i < values.size(); ++i)
        ASSERT_EQ(2.0f * static_cast<float>(i), values[i]);
}

TEST_F(OpenCLGuide, ChoosesGroupSizes) {
    Program const program = built(R"(
        kernel void mark(global int *marks) {
            marks[get_global_id(1) * get_global_size(0) + get_global_id(0)] = get_local_size(0);
        })");
    std::vector<int> marks(2048);
    Buffer const buffer(context, Memory::MEMORY_WRITE_ONLY, false, marks.size() * sizeof(int));
    Kernel kernel = program.kernel("mark");
    kernel.setArg(0, buffer);
    // [ranges]
    // 64 by 32 work items in groups of 16 by 8; the offset is not used.
    queue.enqueueKernel(kernel, Range<2>(64, 32), Range<2>(16, 8), 0);
    // [ranges]
    queue.enqueueBlockingRead(buffer, 0, marks.size() * sizeof(int), marks.data());
    EXPECT_EQ(std::vector<int>(2048, 16), marks);
}

TEST_F(OpenCLGuide, ShowsTheBuildLog) {
    // [log]
    Program program(context, "kernel void broken(global float *v) { v[0] = missing; }");
    try {
        program.build("");
    } catch (ExceptionOCL const &failure) {
        // OCL Exception: CL_BUILD_PROGRAM_FAILURE oru/oru_ocl/programocl.cpp:LINE ()
        std::cerr << failure << '\n' << program.buildLog(device);
    }
    // [log]
    EXPECT_NE(std::string::npos, program.buildLog(device).find("missing"));
}

TEST_F(OpenCLGuide, ReadsImages) {
    std::vector<unsigned char> pixels(256, 100);
    // [image]
    cl_image_format const rgba8 = {CL_RGBA, CL_UNORM_INT8};
    Image2D const source(context, Memory::MEMORY_READ_ONLY, false, rgba8, 8, 8, 0, pixels.data());
    Image2D const target(context, Memory::MEMORY_WRITE_ONLY, false, rgba8, 4, 4, 0);
    Sampler const smooth(context, true, Sampler::ADDRESS_CLAMP_TO_EDGE, Sampler::FILTER_LINEAR);

    Program program(context, R"(
        kernel void shrink(read_only image2d_t source, sampler_t smooth, write_only image2d_t target) {
            int2 at = (int2)(get_global_id(0), get_global_id(1));
            float2 from = (convert_float2(at) + 0.5f) / convert_float2(get_image_dim(target));
            write_imagef(target, at, read_imagef(source, smooth, from));
        })");
    program.build("");
    Kernel shrink = program.kernel("shrink");
    shrink.setArg(0, source);
    shrink.setArg(1, smooth);
    shrink.setArg(2, target);
    queue.enqueueKernel(shrink, Range<2>(4, 4), 0, 0);

    std::vector<unsigned char> small(64);
    ORU::IntegerRect const all({0, 0}, ORU::size2(4, 4));
    queue.enqueueBlockingRead(target, all, small.data(), 0);
    // [image]
    EXPECT_EQ(std::vector<unsigned char>(64, 100), small);
}

TEST_F(OpenCLGuide, WaitsForEvents) {
    Program const program = built("kernel void twice(global int *v) { v[get_global_id(0)] *= 2; }");
    std::vector<int> values(256, 21);
    std::size_t const bytes = values.size() * sizeof(int);
    Buffer buffer(context, Memory::MEMORY_READ_WRITE, false, bytes);
    Kernel kernel = program.kernel("twice");
    kernel.setArg(0, buffer);
    // [events]
    CommandQueue transfers(context, device, true, false); // commands may overtake each other
    Event const written = transfers.enqueueWrite(buffer, 0, bytes, values.data());
    transfers.flush();
    Event const computed = queue.enqueueKernel(kernel, Range<1>(values.size()), 0, 0, {written});
    queue.flush();
    Event read = transfers.enqueueRead(buffer, 0, bytes, values.data(), {computed});
    read.wait();
    // [events]
    EXPECT_EQ(std::vector<int>(256, 42), values);
}

TEST_F(OpenCLGuide, KeepsBuffers) {
    std::vector<float> values(64, 1.0f);
    std::size_t const bytes = values.size() * sizeof(float);
    // [buffers]
    Buffer const scratch(context, Memory::MEMORY_READ_WRITE, false, bytes); // content undefined
    Buffer const copied(context, Memory::MEMORY_READ_ONLY, false, bytes, values.data());
    Buffer staged(context, Memory::MEMORY_READ_WRITE, true, bytes); // quick for the host to reach
    Buffer const inPlace(context, Memory::MEMORY_READ_WRITE, bytes, values.data()); // no copy

    float const part[] = {7, 8};
    queue.enqueueBlockingWrite(staged, 4 * sizeof(float), sizeof part, part); // values 4 and 5
    // [buffers]
    float read[2] = {};
    queue.enqueueBlockingRead(staged, 5 * sizeof(float), sizeof(float), read);
    EXPECT_EQ(8, read[0]);
    queue.enqueueBlockingRead(copied, 0, sizeof read, read);
    EXPECT_EQ(1, read[1]);
}

TEST_F(OpenCLGuide, SumsInGroups) {
    std::vector<float> const values(1024, 0.5f);
    Buffer const input(context, Memory::MEMORY_READ_ONLY, false, values.size() * sizeof(float),
                       const_cast<float *>(values.data()));
    Buffer const sums(context, Memory::MEMORY_WRITE_ONLY, false, 16 * sizeof(float));
    // [local]
    Program program(context, R"(
        kernel void sum(global float const *input, local float *shared, global float *sums) {
            size_t const item = get_local_id(0);
            shared[item] = input[get_global_id(0)];
            for (size_t width = get_local_size(0) / 2; width > 0; width /= 2) {
                barrier(CLK_LOCAL_MEM_FENCE);
                if (item < width)
                    shared[item] += shared[item + width];
            }
            if (item == 0)
                sums[get_group_id(0)] = shared[0];
        })");
    program.build("");
    Kernel sum = program.kernel("sum");
    sum.setArg(0, input);
    sum.setArg(1, nullptr, 64 * sizeof(float)); // local memory: a size, no contents
    sum.setArg(2, sums);
    queue.enqueueKernel(sum, Range<1>(1024), 64, 0); // 16 groups of 64
    // [local]
    std::vector<float> read(16);
    queue.enqueueBlockingRead(sums, 0, read.size() * sizeof(float), read.data());
    EXPECT_EQ(std::vector<float>(16, 32), read);
}

TEST_F(OpenCLGuide, KeepsBinaries) {
    Program const program = built("kernel void nothing() {}");
    // [binaries]
    std::size_t size = 0; // of the one device that the program was built for
    ORU_CL(GetProgramInfo, program.id(), CL_PROGRAM_BINARY_SIZES, sizeof size, &size, nullptr);
    std::vector<unsigned char> binary(size);
    unsigned char *place = binary.data();
    ORU_CL(GetProgramInfo, program.id(), CL_PROGRAM_BINARIES, sizeof place, &place, nullptr);

    Program again(context, Program::BinaryArray({device}, {size}, {binary}));
    again.build("");
    // [binaries]
    again.kernel("nothing");
}

TEST_F(OpenCLGuide, TellsTimes) {
    Program const program = built("kernel void nothing() {}");
    Kernel const kernel = program.kernel("nothing");
    // [times]
    CommandQueue timed(context, device, false, true);
    Event const done = timed.enqueueKernel(kernel, Range<1>(64), 0, 0);
    timed.finish();
    cl_ulong began = 0, ended = 0; // nanoseconds
    ORU_CL(GetEventProfilingInfo, done.id(), CL_PROFILING_COMMAND_START, sizeof began, &began,
           nullptr);
    ORU_CL(GetEventProfilingInfo, done.id(), CL_PROFILING_COMMAND_END, sizeof ended, &ended,
           nullptr);
    // [times]
    EXPECT_LE(began, ended);
    EXPECT_NE(0u, began);
}

TEST_F(OpenCLGuide, NamesTheArgument) {
    Program const program = built("kernel void brighten(global float *v, float f) { v[0] *= f; }");
    std::string told;
    // [argument]
    Kernel brighten = program.kernel("brighten");
    try {
        brighten.setArg(1, 2.0); // a double where the kernel takes a float
    } catch (ExceptionOCL const &failure) {
        told = failure.note(); // "in clSetKernelArg, argument 1 of kernel brighten given 8 bytes"
    }
    // [argument]
    EXPECT_EQ("in clSetKernelArg, argument 1 of kernel brighten given 8 bytes", told);
}

TEST_F(OpenCLGuide, ReachesWhatIsNotWrapped) {
    std::vector<int> values(16, 7);
    Buffer const from(context, Memory::MEMORY_READ_WRITE, false, 64, values.data());
    Buffer const to(context, Memory::MEMORY_READ_WRITE, false, 64);
    // [table]
    ORU_CL(EnqueueCopyBuffer, queue.id(), from.id(), to.id(), 0, 0, 64, 0, nullptr, nullptr);

    FunctionTable const &table = ExtensionManager::instance()->table();
    if (table.clCreateUserEvent) { // OpenCL 1.1
        cl_event const userEvent = ORU_CL(CreateUserEvent, context.id());
        ORU_CL(SetUserEventStatus, userEvent, CL_COMPLETE);
        ORU_CL(ReleaseEvent, userEvent);
    }
    // [table]
    std::vector<int> read(16);
    queue.enqueueBlockingRead(to, 0, 64, read.data());
    EXPECT_EQ(values, read);
}

TEST_F(OpenCLSharingGuide, WorksOnATexture) {
    // [sharing-context]
    ORU::OGL::AutoInitializer openGL;
    ORU::OGL::ContextOffscreen glContext;
    glContext.makeCurrent();

    AutoInitializer openCL;
    Device const device = platforms().front().devices(Device::TYPE_ALL).front();
    bool const shares = device.isSupported(Enum::EXTENSION_KHR_GL_SHARING);
    ContextProperties properties(device.platform());
    if (shares) {
        properties.setSharedRenderContext(glContext.renderContext());
        properties.setDisplayContext(glContext.deviceContext());
    }
    Context const context(properties, device);
    CommandQueue queue(context, device, false, false);
    // [sharing-context]
    if (!shares)
        GTEST_SKIP() << "no runtime that shares: run this test alone";

    using ORU::OGL::Texture;
    ORU::OGL::Texture2D picture(Texture::INTERNALFORMAT_RGBA8, 16, 16, false);
    ORU::OGL::Texture2D negative(Texture::INTERNALFORMAT_RGBA8, 16, 16, false);
    std::vector<unsigned char> pixels(1024);
    std::iota(pixels.begin(), pixels.end(), static_cast<unsigned char>(0));
    ORU_GL(BindTexture, picture.target(), picture.objectID());
    ORU_GL(TexSubImage2D, picture.target(), 0, 0, 0, 16, 16, GL_RGBA, GL_UNSIGNED_BYTE,
           pixels.data());
    Program program(context, R"(
        constant sampler_t exact = CLK_NORMALIZED_COORDS_FALSE | CLK_FILTER_NEAREST;
        kernel void invert(read_only image2d_t from, write_only image2d_t to) {
            int2 at = (int2)(get_global_id(0), get_global_id(1));
            write_imagef(to, at, 1.0f - read_imagef(from, exact, at));
        })");
    program.build("");
    Kernel invert = program.kernel("invert");
    {
        // [sharing]
        Image2D const from(context, Memory::MEMORY_READ_ONLY, picture, 0);
        Image2D const to(context, Memory::MEMORY_WRITE_ONLY, negative, 0);
        invert.setArg(0, from);
        invert.setArg(1, to);

        ORU_GL0(Finish); // OpenGL is done with both textures
        queue.enqueueAcquireGLObjects({from, to});
        queue.enqueueKernel(invert, Range<2>(16, 16), 0, 0);
        queue.enqueueReleaseGLObjects({from, to}).wait(); // now they are OpenGL's again
        // [sharing]
    }
    std::vector<unsigned char> read(pixels.size());
    ORU_GL(BindTexture, negative.target(), negative.objectID());
    ORU_GL(GetTexImage, negative.target(), 0, GL_RGBA, GL_UNSIGNED_BYTE, read.data());
    for (std::size_t i = 0; i < pixels.size(); ++i)
        ASSERT_EQ(255 - pixels[i], read[i]);
}
