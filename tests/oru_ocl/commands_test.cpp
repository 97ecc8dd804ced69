// Programs, kernels, command queues and events.
#include "oru/core/math/tvec2.h"
#include "oru/core/math/tvec4.h"
#include "oru/core/utility/integerrect.h"
#include "tests/support/computetest.h"

#include <chrono>
#include <functional>
#include <set>
#include <thread>

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
    EXPECT_EQ(Program::BUILD_STATUS_ERROR, program.buildStatus(device));
    std::string const log = program.buildLog(device);
    EXPECT_NE(std::string::npos, log.find("VALUE")) << log;
    EXPECT_EQ(std::string::npos, log.find('\0'));
    program.build({device}, "-D VALUE=5");
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
    EXPECT_FAILURE("devs.size() == sizes.size()", Program::BinaryArray({device}, {}, {}));
    EXPECT_FAILURE("sizes.size() == binaries.size()",
                   Program::BinaryArray({device, device}, {size, size}, {binary}));
    EXPECT_FAILURE("OCL Exception: CL_INVALID_BINARY",
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
    EXPECT_EQ(TextOf(program.id(), 1, device().id(), "null", &built),
              runtime()->arguments("clBuildProgram"));
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

TEST_F(CommandQueueTest, EveryItemRunsOnceAtItsPlace) {
    // A kernel that writes each item's place and group size.
    Program const program = build(R"(
kernel void place(global uint4 *out) {
    size_t x = get_global_id(0), y = get_global_id(1), z = get_global_id(2);
    size_t i = (z * get_global_size(1) + y) * get_global_size(0) + x;
    out[i] = (uint4)(x + 1000 * y + 1000000 * z, get_local_size(0), get_local_size(1),
                     get_local_size(2));
})");
    auto const launch = [&](auto global, auto local, auto offset, Range<3> const &groups) {
        std::size_t count = 1;
        for (std::size_t size : global)
            count *= size;
        std::vector<cl_uint4> items(count);
        Buffer const buffer = bufferOf(items);
        queue.enqueueKernel(KernelOf(program, "place", buffer), global, local, offset).wait();
        items = contents<cl_uint4>(buffer, count);
        std::size_t const width = global[0], height = global.size() > 1 ? global.begin()[1] : 1;
        std::size_t wrong = 0;
        for (std::size_t i = 0; i < count; ++i)
            wrong += items[i].s[0] !=
                     i % width + 1000 * (i / width % height) + 1000000 * (i / width / height);
        EXPECT_EQ(0u, wrong);
        if (groups[0] != 0) {
            EXPECT_TRUE(groups == Range<3>(items[0].s[1], items[0].s[2], items[0].s[3]));
        }
    };
    // Sizes that no group size divides, and each dimension on its own.
    using R1 = Range<1>;
    using R2 = Range<2>;
    using R3 = Range<3>;
    launch(R1(4099), R1(0), R1(0), 0);
    launch(R3(13, 7, 5), R3(0), R3(0), 0);
    launch(R1(64), R1(8), R1(0), {8, 1, 1});
    launch(R2(16, 8), R2(8, 4), R2(0), {8, 4, 1});
    launch(R3(4, 6, 8), R3(2, 3, 4), R3(0), {2, 3, 4});
    // The offset does nothing; a local range that begins with 0 leaves the choice to the runtime.
    launch(R2(16, 8), R2(0, 99), R2(5, 5), 0);
    EXPECT_FAILURE("OCL Exception: CL_INVALID_WORK_GROUP_SIZE",
                   launch(R1(1 << 20), R1(1 << 20), R1(0), 0));
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
        {"clEnqueueReadImage", TextOf(image.id(), false, 16, 0, data),
         [&](Waits const &waits) { queue.enqueueRead(image, rect, data, 16, waits); }},
        {"clEnqueueReadImage", TextOf(image.id(), true, 16, 0, data),
         [&](Waits const &waits) { queue.enqueueBlockingRead(image, rect, data, 16, waits); }},
        {"clEnqueueNDRangeKernel", TextOf(kernel.id(), 2),
         [&](Waits const &waits) { queue.enqueueKernel(kernel, Range<2>(4, 4), 0, 0, waits); }},
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
            EXPECT_EQ(TextOf(queue.id()) + command.arguments + TextOf(count) + waitsText,
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

TEST_F(CommandQueueTest, EventsOrderCommandsAcrossQueues) {
    // Steps that do not commute, each on the queue that is next; only its event orders it. A gate
    // holds back the first, so that whatever does not wait comes too early.
    std::size_t const count = 2048;
    std::vector<cl_uint> values = Counting<cl_uint>(count), read(count);
    Buffer const buffer = bufferOf(values);
    Program const program = build("kernel void advance(global uint *v, uint step) {"
                                  " v[get_global_id(0)] = 3 * v[get_global_id(0)] + step; }");
    Kernel advance = KernelOf(program, "advance", buffer);
    CommandQueue queues[] = {CommandQueue(context, device(), false, false),
                             CommandQueue(context, device(), true, false),
                             CommandQueue(context, device(), false, true)};
    cl_uint const first = values.front();
    cl_event const gate = ORU_CL(CreateUserEvent, context.id());
    ORU_CL(EnqueueWriteBuffer, queues[0].id(), buffer.id(), CL_FALSE, 0, sizeof first, &first, 1,
           &gate, nullptr);
    std::vector<Event> all, last;
    for (cl_uint i = 0; i < 24; ++i) {
        advance.setArg(1, i);
        last = {queues[i % 3].enqueueKernel(advance, Range<1>(count), 0, 0, last)};
        all.push_back(last.front());
        queues[i % 3].flush();
        for (cl_uint &value : values)
            value = 3 * value + i;
    }
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
    ORU_CL(SetUserEventStatus, gate, CL_COMPLETE);
    ORU_CL(ReleaseEvent, gate);
    // More events than fit without allocating.
    queue.enqueueBlockingRead(buffer, 0, count * sizeof(cl_uint), read.data(), all);
    EXPECT_EQ(values, read);
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
