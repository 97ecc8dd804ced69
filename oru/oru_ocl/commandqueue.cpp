// OpenCL command queues: work for one device.
#include "oru/oru_ocl/commandqueue.h"

#include "oru/core/utility/integerrect.h"
#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ocl/internal/handlearray.h"

namespace ORU::OCL {

namespace {

/// The properties of OpenCL 1.0 runtimes' queues; out of order wins over profiling.
cl_command_queue_properties QueueProperties(bool outOfOrder, bool profiling) {
    if (outOfOrder)
        return CL_QUEUE_OUT_OF_ORDER_EXEC_MODE_ENABLE;
    return profiling ? CL_QUEUE_PROFILING_ENABLE : 0;
}

} // namespace

CommandQueue::CommandQueue(Context const &context, Device const &device, bool outOfOrder,
                           bool profiling)
    : OpenCLObjectWrapper(ORU_CL(CreateCommandQueue, context.id(), device.id(),
                                 QueueProperties(outOfOrder, profiling))) {}

Event CommandQueue::enqueueWrite(Buffer &buffer, std::size_t offset, std::size_t size,
                                 void const *source, WaitList const &waitList) {
    return enqueueWriteImpl(buffer, false, offset, size, source, waitList);
}

Event CommandQueue::enqueueBlockingWrite(Buffer &buffer, std::size_t offset, std::size_t size,
                                         void const *source, WaitList const &waitList) {
    return enqueueWriteImpl(buffer, true, offset, size, source, waitList);
}

Event CommandQueue::enqueueRead(Buffer const &buffer, std::size_t offset, std::size_t size,
                                void *destination, WaitList const &waitList) {
    return enqueueReadImpl(buffer, false, offset, size, destination, waitList);
}

Event CommandQueue::enqueueBlockingRead(Buffer const &buffer, std::size_t offset, std::size_t size,
                                        void *destination, WaitList const &waitList) {
    return enqueueReadImpl(buffer, true, offset, size, destination, waitList);
}

Event CommandQueue::enqueueRead(Image2D const &image, IntegerRect const &region, void *destination,
                                int rowPitch, WaitList const &waitList) {
    return enqueueReadImpl(image, false, region, 0, 1, destination, rowPitch, 0, waitList);
}

Event CommandQueue::enqueueBlockingRead(Image2D const &image, IntegerRect const &region,
                                        void *destination, int rowPitch, WaitList const &waitList) {
    return enqueueReadImpl(image, true, region, 0, 1, destination, rowPitch, 0, waitList);
}

Event CommandQueue::enqueueAcquireGLObjects(std::vector<Memory> const &objects,
                                            WaitList const &waitList) {
    HandleArray<cl_mem> const memory(objects);
    HandleArray<cl_event> const waits(waitList);
    cl_event event = nullptr;
    ORU_CL(EnqueueAcquireGLObjects, id(), memory.count(), memory.data(), waits.count(),
           waits.data(), &event);
    return Event(event);
}

Event CommandQueue::enqueueReleaseGLObjects(std::vector<Memory> const &objects,
                                            WaitList const &waitList) {
    HandleArray<cl_mem> const memory(objects);
    HandleArray<cl_event> const waits(waitList);
    cl_event event = nullptr;
    ORU_CL(EnqueueReleaseGLObjects, id(), memory.count(), memory.data(), waits.count(),
           waits.data(), &event);
    return Event(event);
}

Event CommandQueue::enqueueMarker() {
    cl_event event = nullptr;
    ORU_CL(EnqueueMarker, id(), &event);
    return Event(event);
}

void CommandQueue::enqueueBarrier() {
    ORU_CL(EnqueueBarrier, id());
}

void CommandQueue::finish() {
    ORU_CL(Finish, id());
}

void CommandQueue::flush() {
    ORU_CL(Flush, id());
}

Event CommandQueue::enqueueWriteImpl(Buffer &buffer, bool blocking, std::size_t offset,
                                     std::size_t size, void const *source,
                                     WaitList const &waitList) {
    HandleArray<cl_event> const waits(waitList);
    cl_event event = nullptr;
    ORU_CL(EnqueueWriteBuffer, id(), buffer.id(), blocking, offset, size, source, waits.count(),
           waits.data(), &event);
    return Event(event);
}

Event CommandQueue::enqueueReadImpl(Buffer const &buffer, bool blocking, std::size_t offset,
                                    std::size_t size, void *destination, WaitList const &waitList) {
    HandleArray<cl_event> const waits(waitList);
    cl_event event = nullptr;
    ORU_CL(EnqueueReadBuffer, id(), buffer.id(), blocking, offset, size, destination, waits.count(),
           waits.data(), &event);
    return Event(event);
}

Event CommandQueue::enqueueReadImpl(Image const &image, bool blocking, IntegerRect const &region,
                                    int z, std::size_t depth, void *destination, int rowPitch,
                                    int slicePitch, WaitList const &waitList) {
    cl_mem_flags flags = 0;
    image.getInfo(Memory::MEMORYINFO_FLAGS, sizeof flags, &flags, nullptr);
    bool const isCompatible =
        (flags & (CL_MEM_READ_WRITE | CL_MEM_WRITE_ONLY | CL_MEM_READ_ONLY)) != 0;
    ORU_ASSERT(isCompatible);

    // A negative coordinate or pitch becomes a huge one, for the runtime to judge.
    std::size_t const origin[] = {static_cast<std::size_t>(region.offset().x),
                                  static_cast<std::size_t>(region.offset().y),
                                  static_cast<std::size_t>(z)};
    std::size_t const extent[] = {region.width(), region.height(), depth};
    HandleArray<cl_event> const waits(waitList);
    cl_event event = nullptr;
    ORU_CL(EnqueueReadImage, id(), image.id(), blocking, origin, extent,
           static_cast<std::size_t>(rowPitch), static_cast<std::size_t>(slicePitch), destination,
           waits.count(), waits.data(), &event);
    return Event(event);
}

Event CommandQueue::enqueueKernel_(CommandQueue const &queue, Kernel const &kernel,
                                   int workDimension, std::size_t const *global,
                                   std::size_t const *local, std::size_t const *offset,
                                   WaitList const *waitList) {
    HandleArray<cl_event> const waits(*waitList);
    cl_event event = nullptr;
    ORU_CL(EnqueueNDRangeKernel, queue.id(), kernel.id(), static_cast<cl_uint>(workDimension),
           offset, global, local, waits.count(), waits.data(), &event);
    return Event(event);
}

} // namespace ORU::OCL
