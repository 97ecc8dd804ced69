// What the compute layer costs over the C calls, and over the official C++ bindings.

#define CL_TARGET_OPENCL_VERSION 110
#define CL_HPP_TARGET_OPENCL_VERSION 110
#define CL_HPP_MINIMUM_OPENCL_VERSION 110
#define CL_HPP_ENABLE_EXCEPTIONS
#include <CL/opencl.hpp>

#include "bench/comparison.h"

#include "oru/core/math/tvec4.h"
#include "oru/oru_ocl/commandqueue.h"
#include "oru/oru_ocl/ocllibrary.h"
#include "oru/oru_ocl/programocl.h"

#include <vector>

namespace OCL = ORU::OCL;
using oru_bench::Comparison;
using oru_bench::Seconds;

namespace {

char const *const kSource = "kernel void nothing(global int *data, float4 v) { data[0] = 1; }";
std::size_t const kLargest = std::size_t(64) << 20;

/// The same objects three times over: the layer's, which own them, the bindings', and handles.
struct World {
    OCL::AutoInitializer layer;
    OCL::Device device = OCL::platforms().front().devices(OCL::Device::TYPE_ALL).front();
    OCL::Context context{OCL::ContextProperties(OCL::platforms().front()), device};
    OCL::CommandQueue queue{context, device, false, false};
    OCL::Buffer buffer{context, OCL::Memory::MEMORY_READ_WRITE, false, kLargest};
    OCL::Kernel kernel = Build(context);
    std::vector<char> host = std::vector<char>(kLargest);

    cl::CommandQueue hppQueue{queue.id(), true};
    cl::Buffer hppBuffer{buffer.id(), true};
    cl::Kernel hppKernel{kernel.id(), true};

    World() {
        kernel.setArg(0, buffer);
        kernel.setArg(1, ambra::lumo::TVec4<float>(1, 2, 3, 4));
    }

    static OCL::Kernel Build(OCL::Context const &context) {
        OCL::Program program(context, kSource);
        program.build("");
        return program.kernel("nothing");
    }
};

World &TheWorld() {
    static World world;
    return world;
}

/// Times `calls` calls of each way, and the end of their commands with them.
template<class Base, class Library>
void CompareCommands(benchmark::State &state, int calls, Base base, Library library) {
    World &world = TheWorld();
    auto const batch = [&](auto const &call) {
        return Seconds([&] {
            for (int i = 0; i < calls; ++i)
                call();
            clFinish(world.queue.id());
        });
    };
    Comparison comparison(state, calls);
    batch(base);
    for (auto _ : state) {
        double const baseSeconds = batch(base);
        comparison.add(baseSeconds, batch(library));
    }
}

/// Every way keeps the command's event, as the layer always does, and lets it go.
struct Launch {
    void raw() const {
        cl_event event;
        std::size_t const size = 1;
        if (clEnqueueNDRangeKernel(world.queue.id(), world.kernel.id(), 1, nullptr, &size, nullptr,
                                   0, nullptr, &event) != CL_SUCCESS)
            std::abort();
        clReleaseEvent(event);
    }
    void bindings() const {
        cl::Event event;
        world.hppQueue.enqueueNDRangeKernel(world.hppKernel, cl::NullRange, cl::NDRange(1),
                                            cl::NullRange, nullptr, &event);
    }
    void oru() const { world.queue.enqueueKernel(world.kernel, OCL::Range<1>(1), 0, 0); }

    World &world = TheWorld();
};

struct SetArguments {
    void raw() const {
        cl_mem const buffer = world.buffer.id();
        cl_float4 const value = {{1, 2, 3, 4}};
        if (clSetKernelArg(world.kernel.id(), 0, sizeof buffer, &buffer) != CL_SUCCESS ||
            clSetKernelArg(world.kernel.id(), 1, sizeof value, &value) != CL_SUCCESS)
            std::abort();
    }
    void bindings() const {
        cl_float4 const value = {{1, 2, 3, 4}};
        world.hppKernel.setArg(0, world.hppBuffer);
        world.hppKernel.setArg(1, value);
    }
    void oru() const {
        world.kernel.setArg(0, world.buffer);
        world.kernel.setArg(1, ambra::lumo::TVec4<float>(1, 2, 3, 4));
    }

    World &world = TheWorld();
};

/// A blocking transfer of `Size` bytes in one direction.
#define ORU_TRANSFER(Direction)                                                                    \
    template<std::size_t Size>                                                                     \
    struct Direction {                                                                             \
        void raw() const {                                                                         \
            cl_event event;                                                                        \
            if (clEnqueue##Direction##Buffer(world.queue.id(), world.buffer.id(), CL_TRUE, 0,      \
                                             Size, world.host.data(), 0, nullptr,                  \
                                             &event) != CL_SUCCESS)                                \
                std::abort();                                                                      \
            clReleaseEvent(event);                                                                 \
        }                                                                                          \
        void bindings() const {                                                                    \
            cl::Event event;                                                                       \
            world.hppQueue.enqueue##Direction##Buffer(world.hppBuffer, CL_TRUE, 0, Size,           \
                                                      world.host.data(), nullptr, &event);         \
        }                                                                                          \
        void oru() const {                                                                         \
            world.queue.enqueueBlocking##Direction(world.buffer, 0, Size, world.host.data());      \
        }                                                                                          \
                                                                                                   \
        World &world = TheWorld();                                                                 \
    };
ORU_TRANSFER(Write)
ORU_TRANSFER(Read)
#undef ORU_TRANSFER

template<class Command>
void OverCalls(benchmark::State &state) {
    Command const command;
    CompareCommands(
        state, static_cast<int>(state.range(0)), [&] { command.raw(); }, [&] { command.oru(); });
}

template<class Command>
void OverBindings(benchmark::State &state) {
    Command const command;
    CompareCommands(
        state, static_cast<int>(state.range(0)), [&] { command.bindings(); },
        [&] { command.oru(); });
}

/// @param calls in a batch  @param batches
#define ORU_OCL_BENCHMARK(Calls, Batches, ...)                                                     \
    BENCHMARK_TEMPLATE(OverCalls, __VA_ARGS__)->Arg(Calls)->UseManualTime()->Iterations(Batches);  \
    BENCHMARK_TEMPLATE(OverBindings, __VA_ARGS__)->Arg(Calls)->UseManualTime()->Iterations(Batches)

ORU_OCL_BENCHMARK(100, 400, Launch);
ORU_OCL_BENCHMARK(1000, 400, SetArguments);
ORU_OCL_BENCHMARK(200, 300, Write<4096>);
ORU_OCL_BENCHMARK(200, 300, Read<4096>);
ORU_OCL_BENCHMARK(1, 60, Write<kLargest>);
ORU_OCL_BENCHMARK(1, 60, Read<kLargest>);

} // namespace
