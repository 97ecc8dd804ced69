// The first kernel of most people: y = a * x + y, for a million values.
#include "examples/opencl/example.h"

#include "oru/oru_ocl/commandqueue.h"

using namespace ORU::OCL;

namespace {

std::size_t const kCount = 1 << 20;

char const *const kSource = R"(
    kernel void saxpy(float a, global float const *x, global float *y) {
        size_t i = get_global_id(0);
        y[i] = a * x[i] + y[i];
    })";

void Saxpy() {
    // The layer is open while this lives; the objects below must be gone before.
    AutoInitializer const library;
    Platform const platform = platforms().front();
    Device const device = platform.devices(Device::TYPE_ALL).front();
    Context const context(ContextProperties(platform), device);
    CommandQueue queue(context, device, false, false); // one command after the other

    // Numbers that floats hold exactly, in whatever order they are added and multiplied.
    float const a = 2.5f;
    std::vector<float> x(kCount), y(kCount), expected(kCount);
    for (std::size_t i = 0; i < kCount; ++i) {
        x[i] = static_cast<float>(i % 1000);
        y[i] = static_cast<float>(i % 77);
        expected[i] = a * x[i] + y[i];
    }
    std::size_t const bytes = kCount * sizeof(float);
    Buffer const xs(context, Memory::MEMORY_READ_ONLY, false, bytes, x.data());
    Buffer const ys(context, Memory::MEMORY_READ_WRITE, false, bytes, y.data());

    Program program(context, kSource);
    program.build("");
    Kernel saxpy = program.kernel("saxpy");
    saxpy.setArg(0, a);
    saxpy.setArg(1, xs);
    saxpy.setArg(2, ys);
    queue.enqueueKernel(saxpy, Range<1>(kCount), 0, 0); // groups as the runtime likes them
    queue.enqueueBlockingRead(ys, 0, bytes, y.data());

    example::Compare(y, expected);
    std::cout << device.name() << " computed " << a << " * x + y of " << kCount
              << " values, all as the host did\n";
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, "", Saxpy);
}
