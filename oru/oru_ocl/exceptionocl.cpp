// The exception of a failed OpenCL call.
#include "oru/oru_ocl/exceptionocl.h"

#include "oru/core/memory/orumemory.h"
#include "oru/oru_ocl/openclheaders.h"

namespace ORU::OCL {

ExceptionOCL::ExceptionOCL(char const *file, unsigned int line, char const *message,
                           unsigned int error)
    : LogicalException(file, static_cast<int>(line), message), errorNumber_(error),
      errorDescription_(std::string("OCL Exception: ") + ErrorToCString(static_cast<int>(error))) {}

ExceptionOCL::~ExceptionOCL() = default;

char const *ExceptionOCL::what() const noexcept {
    return errorDescription_.c_str();
}

ExceptionBase *ExceptionOCL::clone() const {
    return ORU_NEW ExceptionOCL(*this);
}

char const *ExceptionOCL::ErrorToCString(int code) {
    switch (code) {
#define ORU_CL_ERROR(Code)                                                                         \
    case Code:                                                                                     \
        return #Code;
        ORU_CL_ERROR(CL_SUCCESS)
        ORU_CL_ERROR(CL_DEVICE_NOT_FOUND)
        ORU_CL_ERROR(CL_DEVICE_NOT_AVAILABLE)
        ORU_CL_ERROR(CL_COMPILER_NOT_AVAILABLE)
        ORU_CL_ERROR(CL_MEM_OBJECT_ALLOCATION_FAILURE)
        ORU_CL_ERROR(CL_OUT_OF_RESOURCES)
        ORU_CL_ERROR(CL_OUT_OF_HOST_MEMORY)
        ORU_CL_ERROR(CL_PROFILING_INFO_NOT_AVAILABLE)
        ORU_CL_ERROR(CL_MEM_COPY_OVERLAP)
        ORU_CL_ERROR(CL_IMAGE_FORMAT_MISMATCH)
        ORU_CL_ERROR(CL_IMAGE_FORMAT_NOT_SUPPORTED)
        ORU_CL_ERROR(CL_BUILD_PROGRAM_FAILURE)
        ORU_CL_ERROR(CL_MAP_FAILURE)
        ORU_CL_ERROR(CL_INVALID_VALUE)
        ORU_CL_ERROR(CL_INVALID_DEVICE_TYPE)
        ORU_CL_ERROR(CL_INVALID_PLATFORM)
        ORU_CL_ERROR(CL_INVALID_DEVICE)
        ORU_CL_ERROR(CL_INVALID_CONTEXT)
        ORU_CL_ERROR(CL_INVALID_QUEUE_PROPERTIES)
        ORU_CL_ERROR(CL_INVALID_COMMAND_QUEUE)
        ORU_CL_ERROR(CL_INVALID_HOST_PTR)
        ORU_CL_ERROR(CL_INVALID_MEM_OBJECT)
        ORU_CL_ERROR(CL_INVALID_IMAGE_FORMAT_DESCRIPTOR)
        ORU_CL_ERROR(CL_INVALID_IMAGE_SIZE)
        ORU_CL_ERROR(CL_INVALID_SAMPLER)
        ORU_CL_ERROR(CL_INVALID_BINARY)
        ORU_CL_ERROR(CL_INVALID_BUILD_OPTIONS)
        ORU_CL_ERROR(CL_INVALID_PROGRAM)
        ORU_CL_ERROR(CL_INVALID_PROGRAM_EXECUTABLE)
        ORU_CL_ERROR(CL_INVALID_KERNEL_NAME)
        ORU_CL_ERROR(CL_INVALID_KERNEL_DEFINITION)
        ORU_CL_ERROR(CL_INVALID_KERNEL)
        ORU_CL_ERROR(CL_INVALID_ARG_INDEX)
        ORU_CL_ERROR(CL_INVALID_ARG_VALUE)
        ORU_CL_ERROR(CL_INVALID_ARG_SIZE)
        ORU_CL_ERROR(CL_INVALID_KERNEL_ARGS)
        ORU_CL_ERROR(CL_INVALID_WORK_DIMENSION)
        ORU_CL_ERROR(CL_INVALID_WORK_GROUP_SIZE)
        ORU_CL_ERROR(CL_INVALID_WORK_ITEM_SIZE)
        ORU_CL_ERROR(CL_INVALID_GLOBAL_OFFSET)
        ORU_CL_ERROR(CL_INVALID_EVENT_WAIT_LIST)
        ORU_CL_ERROR(CL_INVALID_EVENT)
        ORU_CL_ERROR(CL_INVALID_OPERATION)
        ORU_CL_ERROR(CL_INVALID_GL_OBJECT)
        ORU_CL_ERROR(CL_INVALID_BUFFER_SIZE)
        ORU_CL_ERROR(CL_INVALID_MIP_LEVEL)
#undef ORU_CL_ERROR
    default:
        return "UNKNOWN CL ERROR CODE";
    }
}

} // namespace ORU::OCL
