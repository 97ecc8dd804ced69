// Two queues that work at the same time: one moves data while the other computes. Events keep the
// order.
#include "examples/opencl/example.h"

#include "oru/oru_ocl/commandqueue.h"

using namespace ORU::OCL;

namespace {

std::size_t const kParts = 16;
std::size_t const kPartCount = 1 << 16; ///< numbers in a part
std::size_t const kPartBytes = kPartCount * sizeof(cl_uint);

char const *const kSource = R"(
    kernel void collatz(global uint *numbers) {
        uint n = numbers[get_global_id(0)];
        uint steps = 0;
        for (; n != 1; ++steps)
            n = n % 2 == 0 ? n / 2 : 3 * n + 1;
        numbers[get_global_id(0)] = steps;
    })";

cl_uint StepsToOne(cl_uint n) {
    cl_uint steps = 0;
    for (; n != 1; ++steps)
        n = n % 2 == 0 ? n / 2 : 3 * n + 1;
    return steps;
}

/// The buffer of a part, with its kernel: a kernel's arguments may change once it is enqueued, but
/// one for each buffer needs no change.
struct Slot {
    Slot(Context const &context, Program const &program)
        : buffer(context, Memory::MEMORY_READ_WRITE, false, kPartBytes),
          kernel(program.kernel("collatz")) {
        kernel.setArg(0, buffer);
    }
    Buffer buffer;
    Kernel kernel;
};

void Stream() {
    AutoInitializer const library;
    Platform const platform = platforms().front();
    Device const device = platform.devices(Device::TYPE_ALL).front();
    Context const context(ContextProperties(platform), device);
    CommandQueue transfers(context, device, false, false);
    CommandQueue computing(context, device, false, false);

    Program program(context, kSource);
    program.build("");
    Slot slots[2] = {{context, program}, {context, program}};

    std::vector<cl_uint> numbers(kParts * kPartCount), steps(numbers.size()),
        expected(numbers.size());
    for (std::size_t i = 0; i < numbers.size(); ++i) {
        numbers[i] =
            static_cast<cl_uint>(i % 100000 + 1); // on whose way no number outgrows 32 bits
        expected[i] = StepsToOne(numbers[i]);
    }

    // While one part is computed, the one before comes back and the one after goes out. Transfers
    // are in order among themselves: a buffer is read before it is written again.
    auto const send = [&](std::size_t part) {
        Event sent = transfers.enqueueWrite(slots[part % 2].buffer, 0, kPartBytes,
                                            numbers.data() + part * kPartCount);
        transfers.flush(); // or the queue that waits for it might wait for ever
        return sent;
    };
    Event sent = send(0);
    for (std::size_t part = 0; part < kParts; ++part) {
        Slot const &slot = slots[part % 2];
        Event const computed =
            computing.enqueueKernel(slot.kernel, Range<1>(kPartCount), 0, 0, {sent});
        computing.flush();
        if (part + 1 < kParts)
            sent = send(part + 1);
        transfers.enqueueRead(slot.buffer, 0, kPartBytes, steps.data() + part * kPartCount,
                              {computed});
        transfers.flush();
    }
    transfers.finish(); // the last read waited for all the rest

    example::Compare(steps, expected);
    std::cout << device.name() << " counted the Collatz steps of " << steps.size() << " numbers in "
              << kParts << " parts on two queues, all as the host did\n";
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, "", Stream);
}
