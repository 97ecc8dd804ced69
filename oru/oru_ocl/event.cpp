// OpenCL events: the progress of one enqueued command.
#include "oru/oru_ocl/event.h"

#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ocl/commandqueue.h"
#include "oru/oru_ocl/internal/handlearray.h"

namespace ORU::OCL {

CommandQueue Event::commandQueue() const {
    cl_command_queue queue = nullptr;
    ORU_CL(GetEventInfo, id(), CL_EVENT_COMMAND_QUEUE, sizeof queue, &queue, nullptr);
    return CommandQueue(queue, add_ref_tag());
}

unsigned int Event::commandType() const {
    cl_command_type type = 0;
    ORU_CL(GetEventInfo, id(), CL_EVENT_COMMAND_TYPE, sizeof type, &type, nullptr);
    return type;
}

int Event::commandExecutionStatus() const {
    cl_int status = CL_QUEUED;
    ORU_CL(GetEventInfo, id(), CL_EVENT_COMMAND_EXECUTION_STATUS, sizeof status, &status, nullptr);
    return status;
}

void Event::wait() {
    ORU_CL(WaitForEvents, 1, &id());
}

void Event::WaitForEvents(std::vector<Event> const &events) {
    HandleArray<cl_event> const handles(events);
    ORU_CL(WaitForEvents, handles.count(), handles.data());
}

} // namespace ORU::OCL
