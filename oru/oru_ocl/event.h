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

    /// Adds a reference of its own; has its place in the binary interface.
    Event(cl_event event, add_ref_tag const &tag) : OpenCLObjectWrapper(event, tag) {}
};

} // namespace ORU::OCL
