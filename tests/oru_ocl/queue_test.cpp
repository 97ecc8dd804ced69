// Command queues and events: launches, transfers, waiting.
#include "tests/oru_ocl/computetest.h"

using namespace ORU::OCL;
using namespace oru_test;

namespace {

/// With a kernel that writes each item's place and group size.
class LaunchTest : public QueueTest {
protected:
    LaunchTest()
        : program_(build(R"(
kernel void place(global uint4 *out) {
    size_t x = get_global_id(0), y = get_global_id(1), z = get_global_id(2);
    size_t i = (z * get_global_size(1) + y) * get_global_size(0) + x;
    out[i] = (uint4)(x + 1000 * y + 1000000 * z, get_local_size(0), get_local_size(1),
                     get_local_size(2));
})")) {}

    void TearDown() override { EXPECT_EQ(3u, runtime()->liveHandles()); }

    /// Launches over all items; checks that each ran once at its place.
    /// @return the group sizes that the first item saw
    template<unsigned int N>
    Range<3> launch(Range<N> const &global, Range<N> const &local, Range<N> const &offset) {
        std::size_t count = 1;
        for (std::size_t size : global)
            count *= size;
        std::vector<cl_uint4> items(count);
        Buffer const buffer = bufferOf(items);
        Kernel place = program_.kernel("place");
        place.setArg(0, buffer);
        Event event = queue.enqueueKernel(place, global, local, offset);
        event.wait();
        EXPECT_EQ(CL_COMPLETE, event.commandExecutionStatus());
        items = contents<cl_uint4>(buffer, count);
        std::size_t const width = global[0], height = N > 1 ? global[N > 1 ? 1 : 0] : 1;
        std::size_t wrong = 0;
        for (std::size_t i = 0; i < count; ++i)
            wrong += items[i].s[0] !=
                     i % width + 1000 * (i / width % height) + 1000000 * (i / width / height);
        EXPECT_EQ(0u, wrong);
        return Range<3>(items[0].s[1], items[0].s[2], items[0].s[3]);
    }

private:
    Program program_;
};

} // namespace

TEST_F(LaunchTest, EveryItemRunsOnceAtItsPlace) {
    // Sizes that no group size divides, and each dimension on its own.
    launch(Range<1>(1), Range<1>(0), Range<1>(0));
    launch(Range<1>(4099), Range<1>(0), Range<1>(0));
    launch(Range<2>(61, 37), Range<2>(0), Range<2>(0));
    launch(Range<3>(13, 7, 5), Range<3>(0), Range<3>(0));
    EXPECT_TRUE(Range<3>(8, 1, 1) == launch(Range<1>(64), Range<1>(8), Range<1>(0)));
    EXPECT_TRUE(Range<3>(8, 4, 1) == launch(Range<2>(16, 8), Range<2>(8, 4), Range<2>(0)));
    EXPECT_TRUE(Range<3>(2, 3, 4) == launch(Range<3>(4, 6, 8), Range<3>(2, 3, 4), Range<3>(0)));
    // The offset does nothing; a local range that begins with 0 leaves the choice to the runtime.
    launch(Range<2>(16, 8), Range<2>(0, 99), Range<2>(5, 5));
    EXPECT_EQ(CL_INVALID_WORK_GROUP_SIZE,
              ErrorCode([&] { launch(Range<1>(1 << 20), Range<1>(1 << 20), Range<1>(0)); }));
}

using CommandQueueTest = QueueTest;

TEST_F(CommandQueueTest, HaveThePropertiesAskedFor) {
    auto const properties = [this](bool outOfOrder, bool profiling) {
        CommandQueue const made(context, device(), outOfOrder, profiling);
        cl_command_queue_properties value = 0;
        ExtensionManager::instance()->table().clGetCommandQueueInfo(made.id(), CL_QUEUE_PROPERTIES,
                                                                    sizeof value, &value, nullptr);
        return value;
    };
    cl_command_queue_properties const unordered = CL_QUEUE_OUT_OF_ORDER_EXEC_MODE_ENABLE;
    EXPECT_EQ(0u, properties(false, false));
    EXPECT_EQ(cl_command_queue_properties(CL_QUEUE_PROFILING_ENABLE), properties(false, true));
    EXPECT_EQ(unordered, properties(true, false));
    EXPECT_EQ(unordered, properties(true, true));
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
    EXPECT_EQ(CL_INVALID_VALUE,
              ErrorCode([&] { queue.enqueueBlockingRead(buffer, 4092, 8, read.data()); }));
}

TEST_F(CommandQueueTest, EventsOrderCommandsAcrossQueues) {
    // Each step doubles and adds one, on the queue that is next; only its event orders it.
    Program const program = build("kernel void advance(global uint *v) { size_t i = "
                                  "get_global_id(0); v[i] = 2 * v[i] + i; }");
    std::size_t const count = 2048;
    std::vector<cl_uint> values = Counting<cl_uint>(count);
    Buffer const buffer = bufferOf(values);
    CommandQueue queues[] = {CommandQueue(context, device(), true, false),
                             CommandQueue(context, device(), true, false),
                             CommandQueue(context, device(), false, true)};
    Kernel step = program.kernel("advance");
    step.setArg(0, buffer);
    std::vector<Event> all;
    std::vector<Event> last;
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

TEST_F(CommandQueueTest, MarkersAndBarriersFollowTheirCommands) {
    Event const marker = queue.enqueueMarker();
    queue.enqueueBarrier();
    queue.finish();
    EXPECT_EQ(unsigned(CL_COMMAND_MARKER), marker.commandType());
    EXPECT_EQ(CL_COMPLETE, marker.commandExecutionStatus());
    EXPECT_EQ(CL_INVALID_VALUE, ErrorCode([] { Event::WaitForEvents({}); }));
}

TEST_F(CommandQueueTest, AnEventKeepsAReferenceOfItsOwn) {
    {
        Event const event = queue.enqueueMarker();
        EXPECT_EQ(1, runtime()->references(event.id()));
        {
            Event const copy = event;
            EXPECT_EQ(2, runtime()->references(event.id()));
            CommandQueue const same = event.commandQueue();
            EXPECT_EQ(queue.id(), same.id());
            EXPECT_EQ(2, runtime()->references(queue.id()));
        }
        EXPECT_EQ(1, runtime()->references(event.id()));
    }
    EXPECT_EQ(1, runtime()->references(queue.id()));
}
