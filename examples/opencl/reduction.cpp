// A sum of a million numbers: groups of work items add in local memory, which they share.
#include "examples/opencl/example.h"

#include "oru/oru_ocl/commandqueue.h"

#include <numeric>

using namespace ORU::OCL;

namespace {

std::size_t const kCount = 1 << 20;
std::size_t const kGroups = 64;
std::size_t const kItems = 64; ///< work items of a group, a power of two

// Each work item adds every so many-th number, then the items of a group add in pairs, half as many
// of them each time. All of them have to arrive at a barrier before any goes on.
char const *const kSource = R"(
    kernel void sum(global uint const *numbers, uint count, local uint *shared, global uint *sums) {
        uint mine = 0;
        for (size_t i = get_global_id(0); i < count; i += get_global_size(0))
            mine += numbers[i];
        size_t item = get_local_id(0);
        shared[item] = mine;
        for (size_t pairs = get_local_size(0) / 2; pairs > 0; pairs /= 2) {
            barrier(CLK_LOCAL_MEM_FENCE);
            if (item < pairs)
                shared[item] += shared[item + pairs];
        }
        if (item == 0)
            sums[get_group_id(0)] = shared[0];
    })";

void Reduce() {
    AutoInitializer const library;
    Platform const platform = platforms().front();
    Device const device = platform.devices(Device::TYPE_ALL).front();
    Context const context(ContextProperties(platform), device);
    CommandQueue queue(context, device, false, false);

    std::vector<cl_uint> numbers(kCount);
    cl_uint next = 1;
    for (cl_uint &number : numbers)
        number = next = next * 1664525 + 1013904223; // looks like chance
    Buffer const all(context, Memory::MEMORY_READ_ONLY, false, kCount * sizeof(cl_uint),
                     numbers.data());
    Buffer const sums(context, Memory::MEMORY_READ_WRITE, false, kGroups * sizeof(cl_uint));
    Buffer const total(context, Memory::MEMORY_WRITE_ONLY, false, sizeof(cl_uint));

    Program program(context, kSource);
    program.build("");
    Kernel sum = program.kernel("sum");
    auto const add = [&](Buffer const &from, std::size_t count, Buffer const &to,
                         std::size_t groups) {
        sum.setArg(0, from);
        sum.setArg(1, static_cast<cl_uint>(count));
        sum.setArg(2, nullptr, kItems * sizeof(cl_uint)); // local memory has a size and no contents
        sum.setArg(3, to);
        queue.enqueueKernel(sum, Range<1>(groups * kItems), Range<1>(kItems), 0);
    };
    add(all, kCount, sums, kGroups);
    add(sums, kGroups, total, 1); // a single group adds what the groups came to

    std::vector<cl_uint> groupSums(kGroups), result(1);
    queue.enqueueBlockingRead(sums, 0, kGroups * sizeof(cl_uint), groupSums.data());
    queue.enqueueBlockingRead(total, 0, sizeof(cl_uint), result.data());

    // What wraps around does so on both sides.
    std::vector<cl_uint> expected(kGroups);
    for (std::size_t i = 0; i < kCount; ++i)
        expected[i / kItems % kGroups] += numbers[i];
    example::Compare(groupSums, expected);
    example::Compare(result, {std::accumulate(numbers.begin(), numbers.end(), cl_uint(0))});
    std::cout << device.name() << " added " << kCount << " numbers in " << kGroups << " groups of "
              << kItems << ": " << result[0] << ", as the host did\n";
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, "", Reduce);
}
