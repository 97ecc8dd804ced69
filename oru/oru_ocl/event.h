// OpenCL events: the progress of one enqueued command.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/oru_ocl/openclobjectwrapper.h"

#include <vector>

namespace ORU::OCL {

class CommandQueue;

/// Tells how far a command is, and waits for its end. The enqueue operations of `CommandQueue`
/// make events.
///
/// The operations throw ExceptionOCL when the runtime refuses, or a waited-for command failed.
class ORU_API Event : public OpenCLObjectWrapper<cl_event> {
public:
    /// @name Over a handle that was made elsewhere
    /// The tag tells whose reference the object holds.
    /// @{
    Event(cl_event handle, take_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    Event(cl_event handle, add_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    /// @}

    /// The queue of the command (clGetEventInfo).
    CommandQueue commandQueue() const;

    /// Which command it is, a CL_COMMAND_* constant (clGetEventInfo).
    unsigned int commandType() const;

    /// CL_QUEUED, CL_SUBMITTED, CL_RUNNING, CL_COMPLETE, or the negative error code with which the
    /// command failed (clGetEventInfo).
    int commandExecutionStatus() const;

    /// Returns when the command is complete (clWaitForEvents).
    void wait();

    /// Returns when all the commands are complete (clWaitForEvents).
    /// @throws ExceptionOCL CL_INVALID_VALUE for an empty list
    static void WaitForEvents(std::vector<Event> const &events);

private:
    friend class CommandQueue;

    /// Takes over the caller's reference.
    explicit Event(cl_event event) : OpenCLObjectWrapper(event) {}
};

} // namespace ORU::OCL
