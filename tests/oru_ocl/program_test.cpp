// Programs, their binaries and logs, kernels and their arguments.
#include "oru/core/math/tvec2.h"
#include "oru/core/math/tvec4.h"
#include "tests/oru_ocl/computetest.h"

#include <set>

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

std::vector<unsigned char> BinaryOf(Program const &program) {
    std::size_t size = 0;
    ORU_CL(GetProgramInfo, program.id(), CL_PROGRAM_BINARY_SIZES, sizeof size, &size, nullptr);
    std::vector<unsigned char> binary(size);
    unsigned char *pointer = binary.data();
    ORU_CL(GetProgramInfo, program.id(), CL_PROGRAM_BINARIES, sizeof pointer, &pointer, nullptr);
    return binary;
}

} // namespace

TEST_F(ProgramTest, AFailedBuildLeavesALogAndAProgramToBuildAgain) {
    Device const device = ComputeTest::device();
    Program program(context, "kernel void f(global int *d) { d[0] = VALUE; }");
    cl_program const before = program.id();
    EXPECT_EQ(Program::BUILD_STATUS_NONE, program.buildStatus(device));
    EXPECT_THROWN("CL_BUILD_PROGRAM_FAILURE", program.build(""));
    EXPECT_EQ(Program::BUILD_STATUS_ERROR, program.buildStatus(device));
    std::string const log = program.buildLog(device);
    EXPECT_NE(std::string::npos, log.find("VALUE")) << log;
    EXPECT_EQ(std::string::npos, log.find('\0'));

    program.build({device}, "-D VALUE=5");
    EXPECT_EQ(before, program.id());
    EXPECT_EQ(Program::BUILD_STATUS_SUCCESS, program.buildStatus(device));
    EXPECT_THROWN("CL_INVALID_KERNEL_NAME", program.kernel("g"));
}

TEST_F(ProgramTest, EveryKernelIsCreatedOnce) {
    // The source ends at its first NUL.
    Program const program = build(threeKernels + std::string("\0this is no OpenCL C", 21));
    unsigned int const before = runtime()->liveHandles();
    std::set<std::string> names;
    for (Kernel const &kernel : program.kernels()) {
        char name[64] = {};
        ORU_CL(GetKernelInfo, kernel.id(), CL_KERNEL_FUNCTION_NAME, sizeof name, name, nullptr);
        names.insert(name);
        EXPECT_EQ(1, runtime()->references(kernel.id()));
    }
    EXPECT_EQ((std::set<std::string>{"scale", "add", "clear"}), names);
    EXPECT_EQ(before, runtime()->liveHandles());
}

TEST_F(ProgramTest, BinariesMakeTheSameProgram) {
    // The option, too, is in the binary.
    std::vector<unsigned char> const binary = BinaryOf(build(threeKernels, "-D FACTOR=7"));
    Device const device = ComputeTest::device();
    std::size_t const size = binary.size();
    unsigned char const *bytes = binary.data();
    for (Program::BinaryArray const &array : {Program::BinaryArray({device}, {size}, {binary}),
                                              Program::BinaryArray({device.id()}, &size, &bytes)}) {
        EXPECT_EQ(1u, array.nBinary());
        EXPECT_EQ(device.id(), array.devices().front());
        EXPECT_EQ(size, array.sizes()[0]);
        EXPECT_NE(bytes, array.binaries()[0]);
        Program program(context, array);
        program.build("");
        std::vector<int> values = Counting<int>(10);
        Buffer const buffer = bufferOf(values);
        queue.enqueueKernel(KernelOf(program, "scale", buffer), Range<1>(10), 0, 0);
        for (int &value : values)
            value *= 7;
        EXPECT_EQ(values, contents<int>(buffer, 10));
    }
    EXPECT_THROWN("devs.size() == sizes.size()", Program::BinaryArray({device}, {}, {}));
    EXPECT_THROWN("sizes.size() == binaries.size()",
                  Program::BinaryArray({device, device}, {size, size}, {binary}));
    EXPECT_THROWN("CL_INVALID_BINARY",
                  Program(context, Program::BinaryArray({device}, {4}, {{1, 2, 3, 4}})));
}

TEST_F(ProgramTest, AnAsynchronousBuildCallsBack) {
    Program program(context, threeKernels);
    cl_program built = nullptr;
    auto const notify = [](cl_program done, void *data) {
        *static_cast<cl_program *>(data) = done;
    };
    program.buildAsync({device()}, "", {notify, &built});
    EXPECT_EQ(program.id(), built) << "the tests' runtime calls back before it returns";
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
    EXPECT_EQ(3, runtime()->references(context.id())) << "each program holds its context";
}

TEST_F(ProgramTest, ArgumentsArriveInTheirTypes) {
    Program const program = build(R"(
kernel void take(global float *f, global int *i, float2 f2, float4 f4, int2 i2, int4 i4, int scalar,
                 local int *scratch, read_only image2d_t image) {
    scratch[0] = scalar;
    vstore2(f2, 0, f); vstore4(f4, 0, f + 2);
    vstore2(i2, 0, i); vstore4(i4, 0, i + 2);
    i[6] = scratch[0]; i[7] = get_image_width(image); i[8] = get_image_height(image);
})");
    Buffer const floats(context, writes, false, 6 * sizeof(float));
    Buffer const ints(context, writes, false, 9 * sizeof(int));
    Image2D const image(context, reads, false, rgba8, 11, 13, 0);
    int const scalar = 42;
    Kernel take = KernelOf(program, "take", floats);
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
    EXPECT_THROWN("CL_INVALID_ARG_INDEX", take.setArg(9, &scalar, sizeof scalar));
}
