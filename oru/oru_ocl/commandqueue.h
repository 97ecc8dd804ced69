// OpenCL command queues: work for one device.
#pragma once

#include "oru/oru_ocl/bufferocl.h"
#include "oru/oru_ocl/event.h"
#include "oru/oru_ocl/image.h"
#include "oru/oru_ocl/kernel.h"
#include "oru/oru_ocl/range.h"

#include <type_traits>
#include <vector>

namespace ORU {
class IntegerRect;
}

namespace ORU::OCL {

/// Submits commands to one device of a context.
///
/// Every enqueue operation takes a list of events to wait for before the command starts, and
/// returns the command's own event. Memory given to a transfer that does not block must stay valid
/// and, for a write, unchanged until the event is complete. All operations throw
/// InternalException "table_ != 0" when the layer is not initialised, and ExceptionOCL when the
/// runtime refuses.
///
/// ```cpp
/// CommandQueue queue(context, device, false, false); // in order, without profiling
/// kernel.setArg(0, buffer);
/// kernel.setArg(1, 2.0f);
/// queue.enqueueKernel(kernel, Range<1>(count), 0, 0);
/// queue.enqueueBlockingRead(buffer, 0, count * sizeof(float), values.data());
/// ```
class ORU_API CommandQueue : public OpenCLObjectWrapper<cl_command_queue> {
public:
    /// Events to wait for; none by default.
    using WaitList = std::vector<Event>;

    /// Makes a queue (clCreateCommandQueue).
    /// @param outOfOrder whether commands may overtake each other; such a queue never profiles
    /// @param profiling whether to keep times (clGetEventProfilingInfo of the function table)
    CommandQueue(Context const &context, Device const &device, bool outOfOrder, bool profiling);

    /// @name Over a handle that was made elsewhere
    /// The tag tells whose reference the object holds.
    /// @{
    CommandQueue(cl_command_queue handle, take_ref_tag const &tag)
        : OpenCLObjectWrapper(handle, tag) {}
    CommandQueue(cl_command_queue handle, add_ref_tag const &tag)
        : OpenCLObjectWrapper(handle, tag) {}
    /// @}

    /// @name Buffer transfers
    /// clEnqueueWriteBuffer, clEnqueueReadBuffer. Offset and size are in bytes.
    /// @{
    Event enqueueWrite(Buffer &buffer, std::size_t offset, std::size_t size, void const *source,
                       WaitList const &waitList = {});
    Event enqueueBlockingWrite(Buffer &buffer, std::size_t offset, std::size_t size,
                               void const *source, WaitList const &waitList = {});
    Event enqueueRead(Buffer const &buffer, std::size_t offset, std::size_t size, void *destination,
                      WaitList const &waitList = {});
    Event enqueueBlockingRead(Buffer const &buffer, std::size_t offset, std::size_t size,
                              void *destination, WaitList const &waitList = {});
    /// @}

    /// @name Image transfers
    /// clEnqueueReadImage of a rectangle in pixels.
    /// @param rowPitch bytes from one row to the next at the destination; 0 for rows that follow
    ///     each other
    /// @throws InternalException "isCompatible" for an image whose access the runtime does not tell
    /// @{
    Event enqueueRead(Image2D const &image, IntegerRect const &region, void *destination,
                      int rowPitch, WaitList const &waitList = {});
    Event enqueueBlockingRead(Image2D const &image, IntegerRect const &region, void *destination,
                              int rowPitch, WaitList const &waitList = {});
    /// @}

    /// Launches a kernel over a range of one, two or three dimensions (clEnqueueNDRangeKernel).
    /// @param global work items in each dimension
    /// @param local work items of a group; the runtime chooses when the first of them is 0
    /// @param offset not used: launches start at 0, since OpenCL 1.0 knows no offset
    template<unsigned int N>
    Event enqueueKernel(Kernel const &kernel, Range<N> const &global,
                        std::common_type_t<Range<N>> const &local,
                        std::common_type_t<Range<N>> const &offset, WaitList const &waitList = {}) {
        static_cast<void>(offset);
        return enqueueKernel_(*this, kernel, static_cast<int>(N), global.begin(),
                              local[0] == 0 ? nullptr : local.begin(), nullptr, &waitList);
    }

    /// @name Sharing with OpenGL
    /// OpenGL must have finished with the objects before the acquisition, and their owner must
    /// have released them before OpenGL uses them again (clEnqueueAcquireGLObjects,
    /// clEnqueueReleaseGLObjects).
    /// @{
    Event enqueueAcquireGLObjects(std::vector<Memory> const &objects,
                                  WaitList const &waitList = {});
    Event enqueueReleaseGLObjects(std::vector<Memory> const &objects,
                                  WaitList const &waitList = {});
    /// @}

    /// An event that completes when all commands before it have (clEnqueueMarker).
    Event enqueueMarker();

    /// Later commands start when all earlier ones are complete (clEnqueueBarrier).
    void enqueueBarrier();

    /// Returns when all commands are complete (clFinish).
    void finish();

    /// Hands all commands to the device (clFlush).
    void flush();

private:
    Event enqueueWriteImpl(Buffer &buffer, bool blocking, std::size_t offset, std::size_t size,
                           void const *source, WaitList const &waitList);
    Event enqueueReadImpl(Buffer const &buffer, bool blocking, std::size_t offset, std::size_t size,
                          void *destination, WaitList const &waitList);
    Event enqueueReadImpl(Image const &image, bool blocking, IntegerRect const &region, int z,
                          std::size_t depth, void *destination, int rowPitch, int slicePitch,
                          WaitList const &waitList);
    static Event enqueueKernel_(CommandQueue const &queue, Kernel const &kernel, int workDimension,
                                std::size_t const *global, std::size_t const *local,
                                std::size_t const *offset, WaitList const *waitList);
};

} // namespace ORU::OCL
