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

} // namespace

TEST_F(ProgramTest, AFailedBuildLeavesALogAndAProgramToBuildAgain) {
    Program program(context, "kernel void f(global int *d) { d[0] = VALUE; }");
    EXPECT_EQ(Program::BUILD_STATUS_NONE, program.buildStatus(device));
    EXPECT_FAILURE("OCL Exception: CL_BUILD_PROGRAM_FAILURE", program.build(""));
    EXPECT_EQ(TextOf(program.id(), 1, device.id(), "null", kNone, kNone),
              runtime->arguments("clBuildProgram"));
    EXPECT_EQ(Program::BUILD_STATUS_ERROR, program.buildStatus(device));
    std::string const log = program.buildLog(device);
    EXPECT_NE(std::string::npos, log.find("VALUE")) << log;
    EXPECT_EQ(std::string::npos, log.find('\0'));
    auto *const notify = +[](cl_program, void *) {};
    program.buildAsync({}, "-D VALUE=5", {notify, &program});
    EXPECT_EQ(
        TextOf(program.id(), 0, "null", "-D VALUE=5", reinterpret_cast<void *>(notify), &program),
        runtime->arguments("clBuildProgram"));
    EXPECT_EQ(Program::BUILD_STATUS_SUCCESS, program.buildStatus(device));
}

TEST_F(ProgramTest, EveryKernelIsCreatedOnce) {
    // The source ends at its first NUL.
    std::string const kernels = "kernel void f() {} kernel void g() {}";
    Program const program = built(kernels + std::string("\0this is no OpenCL C", 20));
    std::set<std::string> names;
    for (Kernel const &kernel : program.kernels()) {
        char name[64] = {};
        ORU_CL(GetKernelInfo, kernel.id(), CL_KERNEL_FUNCTION_NAME, sizeof name, name, nullptr);
        names.insert(name);
        EXPECT_EQ(1, runtime->references().at(kernel.id()));
    }
    EXPECT_EQ((std::set<std::string>{"f", "g"}), names);
}

TEST_F(ProgramTest, BinariesMakeTheSameProgram) {
    Program const source = built("kernel void f() {}");
    std::size_t size = 0;
    ORU_CL(GetProgramInfo, source.id(), CL_PROGRAM_BINARY_SIZES, sizeof size, &size, nullptr);
    std::vector<unsigned char> binary(size);
    unsigned char *to = binary.data();
    ORU_CL(GetProgramInfo, source.id(), CL_PROGRAM_BINARIES, sizeof to, &to, nullptr);
    unsigned char const *bytes = to;
    for (Program::BinaryArray const &array : {Program::BinaryArray({device}, {size}, {binary}),
                                              Program::BinaryArray({device.id()}, &size, &bytes)}) {
        EXPECT_NE(bytes, array.binaries()[0]);
        Program program(context, array);
        EXPECT_EQ(TextOf(context.id(), 1, device.id(), size),
                  runtime->arguments("clCreateProgramWithBinary"));
        program.build("");
        EXPECT_NE(nullptr, program.kernel("f").id());
    }
    EXPECT_FAILURE("devs.size() == sizes.size()", Program::BinaryArray({device}, {}, {}));
    EXPECT_FAILURE("sizes.size() == binaries.size()", Program::BinaryArray({device}, {size}, {}));
    EXPECT_FAILURE("Program::BinaryArray binary 0 holds 1 bytes, not the 2 given as its size",
                   Program::BinaryArray({device}, {2}, {{0}}));
}

TEST_F(ProgramTest, ArgumentsArriveInTheirTypes) {
    Kernel kernel = built("kernel void f(float2 a, float4 b, int2 c, int4 d, int e, "
                          "local int *scratch, read_only image2d_t image) {}")
                        .kernel("f");
    auto const passed = [&](unsigned int index, void const *value, std::size_t size) {
        EXPECT_EQ(TextOf(kernel.id(), index, size, value), runtime->arguments("clSetKernelArg"));
    };
    auto const passes = [&](unsigned int index, auto const &value) {
        kernel.setArg(index, value);
        passed(index, &value, sizeof value);
    };
    passes(0, TVec2<float>(1.5f, -2.5f));
    passes(1, TVec4<float>(3, 4, 5, 6));
    passes(2, TVec2<int>(-7, 8));
    passes(3, TVec4<int>(9, 10, -11, 12));
    passes(4, 42);
    kernel.setArg(5, nullptr, 16);
    passed(5, nullptr, 16);
    Image2D const image(context, kReads, false, kRGBA8, 11, 13, 0);
    kernel.setArg(6, image);
    passed(6, &image.id(), sizeof(cl_mem));
}

TEST_F(CommandQueueTest, QueuesHaveThePropertiesAskedFor) {
    cl_command_queue_properties const expected[] = {0, CL_QUEUE_PROFILING_ENABLE,
                                                    CL_QUEUE_OUT_OF_ORDER_EXEC_MODE_ENABLE,
                                                    CL_QUEUE_OUT_OF_ORDER_EXEC_MODE_ENABLE};
    for (int i = 0; i < 4; ++i) {
        CommandQueue const made(context, device, i >= 2, i % 2 == 1);
        EXPECT_EQ(TextOf(context.id(), device.id(), expected[i]),
                  runtime->arguments("clCreateCommandQueue"));
    }
}

TEST_F(CommandQueueTest, CommandsPassWhatTheyAreGivenAndTheirWaits) {
    std::vector<int> values(64);
    int *const data = values.data();
    Buffer buffer(context, kBoth, false, 256);
    Image2D const image(context, kBoth, false, kRGBA8, 4, 4, 0);
    ORU::IntegerRect const rect({1, 2}, {3, 1});
    Kernel const kernel = built("kernel void f() {}").kernel("f");
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
                      runtime->arguments(command.entryPoint))
                << command.entryPoint;
        }
        waits.push_back(queue.enqueueMarker());
        waitsText += TextOf(waits.back().id());
        Event::WaitForEvents(waits);
        EXPECT_EQ(TextOf(count + 1) + waitsText, runtime->arguments("clWaitForEvents"));
    }
    queue.finish();
}

TEST_F(CommandQueueTest, EventsTellAboutTheirCommand) {
    Event const marker = queue.enqueueMarker();
    queue.enqueueBarrier();
    queue.finish();
    EXPECT_EQ(unsigned(CL_COMMAND_MARKER), marker.commandType());
    EXPECT_EQ(CL_COMPLETE, marker.commandExecutionStatus());
    CommandQueue const same = marker.commandQueue();
    EXPECT_EQ(queue.id(), same.id());
    EXPECT_EQ(2, runtime->references().at(queue.id()));
}
