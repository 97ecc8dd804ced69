// A program that does not build, what a host can tell of it, and the same program built as it wants
// to be.
#include "examples/opencl/example.h"

#include "oru/oru_ocl/commandqueue.h"

using namespace ORU::OCL;

namespace {

// GAIN is for the build's options to define.
char const *const kSource = R"(
    kernel void amplify(global int *values) {
        values[get_global_id(0)] *= GAIN;
    })";

/// Builds without GAIN, which has to fail, and tells what a person needs to know.
void FailToBuild(Program &program, Device const &device) {
    try {
        program.build("");
    } catch (ExceptionOCL const &failure) {
        if (failure.errorNumber() != static_cast<unsigned int>(CL_BUILD_PROGRAM_FAILURE))
            throw; // not about the source: no memory, say
        std::cout << "The failure: " << failure.errorDescription() << "\n"
                  << "Its place:   " << failure.file() << ':' << failure.line() << "\n"
                  << "Its notes:   " << failure.note() << "\n"
                  << "The compiler of " << device.name() << " says:\n"
                  << program.buildLog(device) << '\n';
        return;
    }
    throw std::runtime_error("the program without GAIN was built");
}

void BuildTwice() {
    AutoInitializer const library;
    Platform const platform = platforms().front();
    Device const device = platform.devices(Device::TYPE_ALL).front();
    Context const context(ContextProperties(platform), device);
    CommandQueue queue(context, device, false, false);

    Program program(context, kSource);
    FailToBuild(program, device);
    if (program.buildStatus(device) != Program::BUILD_STATUS_ERROR)
        throw std::runtime_error("the status of the build is not an error");

    program.build("-D GAIN=3"); // a program may be built again
    std::vector<cl_int> values(1000), expected(values.size());
    for (std::size_t i = 0; i < values.size(); ++i) {
        values[i] = static_cast<cl_int>(i) - 500;
        expected[i] = 3 * values[i];
    }
    std::size_t const bytes = values.size() * sizeof(cl_int);
    Buffer const buffer(context, Memory::MEMORY_READ_WRITE, false, bytes, values.data());
    Kernel amplify = program.kernel("amplify");
    amplify.setArg(0, buffer);
    queue.enqueueKernel(amplify, Range<1>(values.size()), 0, 0);
    queue.enqueueBlockingRead(buffer, 0, bytes, values.data());
    example::Compare(values, expected);
    std::cout << "Built again with -D GAIN=3, it amplified " << values.size()
              << " values as the host did.\n";
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, "", BuildTwice);
}
