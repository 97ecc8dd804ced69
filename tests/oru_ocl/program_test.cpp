// Programs, their binaries and logs, kernels and their arguments.
#include "oru/core/math/tvec2.h"
#include "oru/core/math/tvec4.h"
#include "tests/oru_ocl/computetest.h"

#include <atomic>
#include <chrono>
#include <set>
#include <thread>

using ambra::lumo::TVec2;
using ambra::lumo::TVec4;
using namespace ORU::OCL;
using namespace oru_test;

namespace {

using ProgramTest = QueueTest;

char const *const threeKernels = R"(
#ifndef FACTOR
#define FACTOR 1
#endif
kernel void scale(global int *data) { data[get_global_id(0)] *= FACTOR; }
kernel void add(global int *data, int amount) { data[get_global_id(0)] += amount; }
kernel void clear(global int *data) { data[get_global_id(0)] = 0; }
)";

std::string NameOf(Kernel const &kernel) {
    char name[64] = {};
    ExtensionManager::instance()->table().clGetKernelInfo(kernel.id(), CL_KERNEL_FUNCTION_NAME,
                                                          sizeof name, name, nullptr);
    return name;
}

std::vector<unsigned char> BinaryOf(Program const &program) {
    FunctionTable const &cl = ExtensionManager::instance()->table();
    std::size_t size = 0;
    cl.clGetProgramInfo(program.id(), CL_PROGRAM_BINARY_SIZES, sizeof size, &size, nullptr);
    std::vector<unsigned char> binary(size);
    unsigned char *pointer = binary.data();
    cl.clGetProgramInfo(program.id(), CL_PROGRAM_BINARIES, sizeof pointer, &pointer, nullptr);
    return binary;
}

} // namespace

TEST_F(ProgramTest, OptionsReachTheCompiler) {
    std::vector<int> values = Counting<int>(100);
    Buffer const buffer = bufferOf(values);
    Program const program = build(threeKernels, "-D FACTOR=3");
    Kernel scale = program.kernel("scale");
    scale.setArg(0, buffer);
    queue.enqueueKernel(scale, Range<1>(values.size()), 0, 0);
    for (int &value : values)
        value *= 3;
    EXPECT_EQ(values, contents<int>(buffer, values.size()));
}

TEST_F(ProgramTest, AFailedBuildLeavesALogAndAProgramToBuildAgain) {
    Device const device = ComputeTest::device();
    Program program(context, "kernel void f(global int *d) { d[0] = VALUE; }");
    EXPECT_EQ(Program::BUILD_STATUS_NONE, program.buildStatus(device));
    EXPECT_EQ(CL_BUILD_PROGRAM_FAILURE, ErrorCode([&] { program.build(""); }));
    EXPECT_EQ(Program::BUILD_STATUS_ERROR, program.buildStatus(device));
    std::string const log = program.buildLog(device);
    EXPECT_NE(std::string::npos, log.find("VALUE")) << log;
    EXPECT_EQ(std::string::npos, log.find('\0'));
    EXPECT_NE(CL_SUCCESS, ErrorCode([&] { program.kernel("f"); }));

    program.build({device}, "-D VALUE=5");
    EXPECT_EQ(Program::BUILD_STATUS_SUCCESS, program.buildStatus(device));
    EXPECT_EQ(CL_INVALID_KERNEL_NAME, ErrorCode([&] { program.kernel("g"); }));
}

TEST_F(ProgramTest, TheSourceEndsAtItsFirstNul) {
    std::string source = threeKernels;
    source += '\0';
    source += "this is no OpenCL C";
    EXPECT_EQ(3u, build(source).kernels().size());
}

TEST_F(ProgramTest, EveryKernelIsCreatedOnce) {
    Program const program = build(threeKernels);
    unsigned int const before = runtime()->liveHandles();
    {
        std::vector<Kernel> const kernels = program.kernels();
        std::set<std::string> names;
        for (Kernel const &kernel : kernels) {
            names.insert(NameOf(kernel));
            EXPECT_EQ(1, runtime()->references(kernel.id()));
        }
        EXPECT_EQ((std::set<std::string>{"scale", "add", "clear"}), names);
        EXPECT_EQ(before + 3, runtime()->liveHandles());
    }
    EXPECT_EQ(before, runtime()->liveHandles());
}

TEST_F(ProgramTest, BinariesMakeTheSameProgram) {
    Program const source = build(threeKernels, "-D FACTOR=7");
    std::vector<unsigned char> const binary = BinaryOf(source);
    ASSERT_FALSE(binary.empty());
    Device const device = ComputeTest::device();
    Program::BinaryArray const byVectors({device}, {binary.size()}, {binary});
    std::size_t const size = binary.size();
    unsigned char const *bytes = binary.data();
    Program::BinaryArray const byPointers({device.id()}, &size, &bytes);
    for (Program::BinaryArray const &array : {byVectors, byPointers}) {
        EXPECT_EQ(1u, array.nBinary());
        EXPECT_EQ(device.id(), array.devices().front());
        EXPECT_EQ(size, array.sizes()[0]);
        EXPECT_NE(bytes, array.binaries()[0]);
        Program program(context, array);
        program.build("");
        std::vector<int> values = Counting<int>(10);
        Buffer const buffer = bufferOf(values);
        Kernel kernel = program.kernel("scale");
        kernel.setArg(0, buffer);
        queue.enqueueKernel(kernel, Range<1>(10), 0, 0);
        EXPECT_EQ(63, contents<int>(buffer, 10)[9]);
    }
    EXPECT_EQ("devs.size() == sizes.size()",
              InternalMessage([&] { Program::BinaryArray({device}, {}, {}); }));
    EXPECT_EQ("sizes.size() == binaries.size()", InternalMessage([&] {
                  Program::BinaryArray({device, device}, {size, size}, {binary});
              }));
    EXPECT_EQ(CL_INVALID_BINARY, ErrorCode([&] {
                  Program(context, Program::BinaryArray({device}, {4}, {{1, 2, 3, 4}}));
              }));
}

TEST_F(ProgramTest, AnAsynchronousBuildCallsBack) {
    Program program(context, threeKernels);
    struct Call {
        std::atomic<cl_program> program = nullptr;
    } call;
    program.buildAsync(
        {device()}, "",
        {[](cl_program done, void *data) { static_cast<Call *>(data)->program = done; }, &call});
    for (int tries = 0; !call.program && tries < 1000; ++tries)
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    EXPECT_EQ(program.id(), call.program);
    EXPECT_EQ(Program::BUILD_STATUS_SUCCESS, program.buildStatus(device()));
}

TEST_F(ProgramTest, MovedAndAssignedProgramsKeepTheirHandles) {
    Program first = build(threeKernels);
    Program second = std::move(first);
    // The source of a move keeps its handle. NOLINTNEXTLINE(bugprone-use-after-move)
    EXPECT_EQ(first.id(), second.id());
    EXPECT_EQ(2, runtime()->references(second.id()));
    second = Program(context, "kernel void other() {}");
    EXPECT_EQ(1, runtime()->references(first.id()));
    EXPECT_EQ(3u, first.kernels().size());
    // Each program holds its context.
    EXPECT_EQ(3, runtime()->references(context.id()));
}

TEST_F(ProgramTest, ArgumentsArriveInTheirTypes) {
    Program const program = build(R"(
kernel void take(global float *f, global int *i, float2 f2, float4 f4, int2 i2, int4 i4, int scalar,
                 local int *scratch, read_only image2d_t image) {
    int x = get_global_id(0);
    scratch[0] = scalar;
    f[0] = f2.x; f[1] = f2.y; f[2] = f4.x; f[3] = f4.y; f[4] = f4.z; f[5] = f4.w;
    i[0] = i2.x; i[1] = i2.y; i[2] = i4.x; i[3] = i4.y; i[4] = i4.z; i[5] = i4.w;
    i[6] = scratch[0]; i[7] = get_image_width(image); i[8] = get_image_height(image);
})");
    Kernel take = program.kernel("take");
    Buffer const floats(context, Memory::MEMORY_WRITE_ONLY, false, 6 * sizeof(float));
    Buffer const ints(context, Memory::MEMORY_WRITE_ONLY, false, 9 * sizeof(int));
    Image2D const image(context, Memory::MEMORY_READ_ONLY, false, {CL_RGBA, CL_UNORM_INT8}, 11, 13,
                        0);
    int const scalar = 42;
    take.setArg(0, floats);
    take.setArg(1, ints);
    take.setArg(2, TVec2<float>(1.5f, -2.5f));
    take.setArg(3, TVec4<float>(3, 4, 5, 6));
    take.setArg(4, TVec2<int>(-7, 8));
    take.setArg(5, TVec4<int>(9, 10, -11, 12));
    take.setArg(6, &scalar, sizeof scalar);
    take.setArg(7, nullptr, 16);
    take.setArg(8, image);
    queue.enqueueKernel(take, Range<1>(1), 0, 0);
    EXPECT_EQ((std::vector<float>{1.5f, -2.5f, 3, 4, 5, 6}), contents<float>(floats, 6));
    EXPECT_EQ((std::vector<int>{-7, 8, 9, 10, -11, 12, 42, 11, 13}), contents<int>(ints, 9));

    EXPECT_EQ(CL_INVALID_ARG_INDEX, ErrorCode([&] { take.setArg(9, &scalar, sizeof scalar); }));
}
