// Programs, kernels, command queues and events.
#include "oru/core/math/tvec2.h"
#include "oru/core/math/tvec4.h"
#include "oru/core/utility/integerrect.h"
#include "tests/support/computetest.h"

#include <functional>
#include <set>

using ambra::lumo::TVec2;
using ambra::lumo::TVec4;
using namespace ORU::OCL;
using namespace oru_test;

namespace {

using ProgramTest = QueueTest;
using CommandQueueTest = QueueTest;

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
    EXPECT_EQ(Program::BUILD_STATUS_NONE, program.buildStatus(device));
    EXPECT_FAILURE("OCL Exception: CL_BUILD_PROGRAM_FAILURE", program.build(""));
    void *const none = nullptr;
    EXPECT_EQ(TextOf(program.id(), 1, device.id(), "null", none, none),
              runtime()->arguments("clBuildProgram"));
    EXPECT_EQ(Program::BUILD_STATUS_ERROR, program.buildStatus(device));
    std::string const log = program.buildLog(device);
    EXPECT_NE(std::string::npos, log.find("VALUE")) << log;
    EXPECT_EQ(std::string::npos, log.find('\0'));
    auto const notify = [](cl_program, void *) {};
    program.buildAsync({}, "-D VALUE=5", {notify, &program});
    EXPECT_EQ(TextOf(program.id(), 0, "null", "-D VALUE=5", AddressOf(notify), &program),
              runtime()->arguments("clBuildProgram"));
    EXPECT_EQ(Program::BUILD_STATUS_SUCCESS, program.buildStatus(device));
    EXPECT_FAILURE("OCL Exception: CL_INVALID_KERNEL_NAME", program.kernel("g"));
}

TEST_F(ProgramTest, EveryKernelIsCreatedOnce) {
    // The source ends at its first NUL.
    Program const program = build(threeKernels + std::string("\0this is no OpenCL C", 20));
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
        EXPECT_NE(bytes, array.binaries()[0]);
        Program program(context, array);
        EXPECT_EQ(TextOf(context.id(), 1, device.id(), size),
                  runtime()->arguments("clCreateProgramWithBinary"));
        program.build("");
        std::vector<int> values = Counting<int>(10);
        Buffer const buffer = bufferOf(values);
        queue.enqueueKernel(KernelOf(program, "scale", buffer), Range<1>(10), 0, 0);
        for (int &value : values)
            value *= 7;
        EXPECT_EQ(values, contents<int>(buffer, 10));
    }
    EXPECT_FAILURE("devs.size() == sizes.size()", Program::BinaryArray({device}, {}, {}));
    EXPECT_FAILURE("sizes.size() == binaries.size()",
                   Program::BinaryArray({device, device}, {size, size}, {binary}));
    EXPECT_FAILURE("OCL Exception: CL_INVALID_BINARY",
                   Program(context, Program::BinaryArray({device}, {4}, {{1, 2, 3, 4}})));
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
    EXPECT_FAILURE("OCL Exception: CL_INVALID_ARG_INDEX", take.setArg(9, &scalar, sizeof scalar));
}

TEST_F(CommandQueueTest, QueuesHaveThePropertiesAskedFor) {
    cl_command_queue_properties const expected[] = {0, CL_QUEUE_PROFILING_ENABLE,
                                                    CL_QUEUE_OUT_OF_ORDER_EXEC_MODE_ENABLE,
                                                    CL_QUEUE_OUT_OF_ORDER_EXEC_MODE_ENABLE};
    for (int i = 0; i < 4; ++i) {
        CommandQueue const made(context, device(), i >= 2, i % 2 == 1);
        EXPECT_EQ(TextOf(context.id(), device().id(), expected[i]),
                  runtime()->arguments("clCreateCommandQueue"));
    }
}

TEST_F(CommandQueueTest, CommandsPassWhatTheyAreGivenAndTheirWaits) {
    std::vector<int> values(64);
    int *const data = values.data();
    Buffer buffer = bufferOf(values);
    Image2D const image(context, both, false, rgba8, 4, 4, 0);
    ORU::IntegerRect const rect({1, 2}, {3, 1});
    Kernel const kernel = KernelOf(build(threeKernels), "clear", buffer);
    std::vector<Memory> const objects = {image, buffer};
    using Waits = CommandQueue::WaitList;
    struct Command {
        char const *entryPoint;
        std::string arguments; ///< between the queue and the events to wait for
        std::function<void(Waits const &)> enqueue;
    };
    Command const commands[] = {
        {"clEnqueueWriteBuffer", TextOf(buffer.id(), false, 4, 8, data),
         [&](Waits const &waits) { queue.enqueueWrite(buffer, 4, 8, data, waits); }},
        {"clEnqueueWriteBuffer", TextOf(buffer.id(), true, 4, 8, data),
         [&](Waits const &waits) { queue.enqueueBlockingWrite(buffer, 4, 8, data, waits); }},
        {"clEnqueueReadBuffer", TextOf(buffer.id(), false, 4, 8, data),
         [&](Waits const &waits) { queue.enqueueRead(buffer, 4, 8, data, waits); }},
        {"clEnqueueReadBuffer", TextOf(buffer.id(), true, 4, 8, data),
         [&](Waits const &waits) { queue.enqueueBlockingRead(buffer, 4, 8, data, waits); }},
        {"clEnqueueReadImage", TextOf(image.id(), false, 1, 2, 0, 3, 1, 1, 16, 0, data),
         [&](Waits const &waits) { queue.enqueueRead(image, rect, data, 16, waits); }},
        {"clEnqueueReadImage", TextOf(image.id(), true, 1, 2, 0, 3, 1, 1, 16, 0, data),
         [&](Waits const &waits) { queue.enqueueBlockingRead(image, rect, data, 16, waits); }},
        {"clEnqueueNDRangeKernel", TextOf(kernel.id(), 1, "null", 8, 4),
         [&](Waits const &waits) { queue.enqueueKernel(kernel, Range<1>(8), 4, 2, waits); }},
        {"clEnqueueNDRangeKernel", TextOf(kernel.id(), 2, "null", 8, 6, "null"),
         [&](Waits const &waits) {
             queue.enqueueKernel(kernel, Range<2>(8, 6), {0, 9}, 0, waits);
         }},
        {"clEnqueueNDRangeKernel", TextOf(kernel.id(), 3, "null", 8, 6, 4, 4, 3, 2),
         [&](Waits const &waits) {
             queue.enqueueKernel(kernel, Range<3>(8, 6, 4), {4, 3, 2}, 0, waits);
         }},
        {"clEnqueueAcquireGLObjects", TextOf(2, image.id(), buffer.id()),
         [&](Waits const &waits) { queue.enqueueAcquireGLObjects(objects, waits); }},
        {"clEnqueueReleaseGLObjects", TextOf(2, image.id(), buffer.id()),
         [&](Waits const &waits) { queue.enqueueReleaseGLObjects(objects, waits); }},
    };
    // Up to more events than fit without allocating.
    Waits waits;
    std::string waitsText;
    for (int count = 0; count <= 18; ++count) {
        for (Command const &command : commands) {
            command.enqueue(waits);
            EXPECT_EQ(TextOf(queue.id()) + command.arguments + TextOf(count) +
                          (count > 0 ? waitsText : TextOf("null")),
                      runtime()->arguments(command.entryPoint))
                << command.entryPoint;
        }
        waits.push_back(queue.enqueueMarker());
        waitsText += TextOf(waits.back().id());
        Event::WaitForEvents(waits);
        EXPECT_EQ(TextOf(count + 1) + waitsText, runtime()->arguments("clWaitForEvents"));
    }
    queue.finish();
}

TEST_F(CommandQueueTest, EventsTellAboutTheirCommand) {
    int const value = 1;
    Buffer buffer(context, both, false, sizeof value);
    Event const write = queue.enqueueWrite(buffer, 0, sizeof value, &value);
    Event const marker = queue.enqueueMarker();
    queue.enqueueBarrier();
    queue.finish();
    EXPECT_EQ(unsigned(CL_COMMAND_WRITE_BUFFER), write.commandType());
    EXPECT_EQ(unsigned(CL_COMMAND_MARKER), marker.commandType());
    EXPECT_EQ(CL_COMPLETE, marker.commandExecutionStatus());
    CommandQueue const same = marker.commandQueue();
    EXPECT_EQ(queue.id(), same.id());
    EXPECT_EQ(2, runtime()->references(queue.id()));
    EXPECT_FAILURE("OCL Exception: CL_INVALID_VALUE", Event::WaitForEvents({}));
}
