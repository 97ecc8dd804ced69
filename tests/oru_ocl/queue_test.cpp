// Command queues and events: launches, transfers, waiting.
#include "tests/oru_ocl/computetest.h"

using namespace ORU::OCL;
using namespace oru_test;

using CommandQueueTest = QueueTest;

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
    EXPECT_THROWN("CL_INVALID_WORK_GROUP_SIZE", launch(R1(1 << 20), R1(1 << 20), R1(0), 0));
}

TEST_F(CommandQueueTest, HaveThePropertiesAskedFor) {
    cl_command_queue_properties const expected[] = {0, CL_QUEUE_PROFILING_ENABLE,
                                                    CL_QUEUE_OUT_OF_ORDER_EXEC_MODE_ENABLE,
                                                    CL_QUEUE_OUT_OF_ORDER_EXEC_MODE_ENABLE};
    for (int i = 0; i < 4; ++i) {
        CommandQueue const made(context, device(), i >= 2, i % 2 == 1);
        cl_command_queue_properties value = 0;
        ORU_CL(GetCommandQueueInfo, made.id(), CL_QUEUE_PROPERTIES, sizeof value, &value, nullptr);
        EXPECT_EQ(expected[i], value) << i;
    }
}

TEST_F(CommandQueueTest, TransfersReachTheBytesTheyName) {
    std::vector<int> expected = Counting<int>(1024);
    Buffer buffer = bufferOf(expected);
    std::vector<int> const piece = {-1, -2, -3, -4, -5};
    std::size_t const bytes = piece.size() * sizeof(int);
    Event write = queue.enqueueWrite(buffer, 100 * sizeof(int), bytes, piece.data());
    std::copy(piece.begin(), piece.end(), expected.begin() + 100);
    queue.enqueueBlockingWrite(buffer, 1019 * sizeof(int), bytes, piece.data(), {write});
    std::copy(piece.begin(), piece.end(), expected.begin() + 1019);
    EXPECT_EQ(expected, contents<int>(buffer, 1024));
    std::vector<int> read(7);
    Event const event =
        queue.enqueueRead(buffer, 98 * sizeof(int), read.size() * sizeof(int), read.data());
    Event::WaitForEvents({event, write});
    EXPECT_EQ((std::vector<int>{98, 99, -1, -2, -3, -4, -5}), read);
    EXPECT_EQ(unsigned(CL_COMMAND_READ_BUFFER), event.commandType());
    EXPECT_EQ(unsigned(CL_COMMAND_WRITE_BUFFER), write.commandType());
}

TEST_F(CommandQueueTest, EventsOrderCommandsAcrossQueues) {
    // Each step doubles and adds, on the queue that is next; only its event orders it.
    std::size_t const count = 2048;
    std::vector<cl_uint> values = Counting<cl_uint>(count);
    Buffer const buffer = bufferOf(values);
    Kernel const step = KernelOf(build("kernel void advance(global uint *v) { size_t i = "
                                       "get_global_id(0); v[i] = 2 * v[i] + i; }"),
                                 "advance", buffer);
    CommandQueue queues[] = {CommandQueue(context, device(), true, false),
                             CommandQueue(context, device(), true, false),
                             CommandQueue(context, device(), false, true)};
    std::vector<Event> all, last;
    for (int i = 0; i < 24; ++i) {
        last = {queues[i % 3].enqueueKernel(step, Range<1>(count), 0, 0, last)};
        all.push_back(last.front());
        queues[i % 3].flush();
        for (std::size_t item = 0; item < count; ++item)
            values[item] = 2 * values[item] + static_cast<cl_uint>(item);
    }
    // More events than fit without allocating.
    std::vector<cl_uint> read(count);
    queue.enqueueBlockingRead(buffer, 0, count * sizeof(cl_uint), read.data(), all);
    EXPECT_EQ(values, read);
    Event::WaitForEvents(all);
    EXPECT_EQ(queues[2].id(), all[2].commandQueue().id());
}

TEST_F(CommandQueueTest, EventsTellAboutTheirCommand) {
    Event const marker = queue.enqueueMarker();
    queue.enqueueBarrier();
    queue.finish();
    EXPECT_EQ(unsigned(CL_COMMAND_MARKER), marker.commandType());
    EXPECT_EQ(CL_COMPLETE, marker.commandExecutionStatus());
    EXPECT_EQ(1, runtime()->references(marker.id()));
    {
        Event const copy = marker;
        EXPECT_EQ(2, runtime()->references(marker.id()));
        CommandQueue const same = copy.commandQueue();
        EXPECT_EQ(2, runtime()->references(queue.id()));
    }
    EXPECT_EQ(1, runtime()->references(marker.id()));
    EXPECT_EQ(1, runtime()->references(queue.id()));
    EXPECT_THROWN("CL_INVALID_VALUE", Event::WaitForEvents({}));
}
