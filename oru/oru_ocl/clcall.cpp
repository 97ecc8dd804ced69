// The one place where a failed OpenCL call throws.
#include "oru/oru_ocl/clcall.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ocl/exceptionocl.h"

#include <string_view>

namespace ORU::OCL {

namespace {

/// The name of a code that is younger than OpenCL 1.0 or of an extension, null for any other.
char const *LaterErrorName(cl_int code) {
    switch (code) {
#define ORU_CL_ERROR(Code)                                                                         \
    case Code:                                                                                     \
        return #Code;
        ORU_CL_ERROR(CL_MISALIGNED_SUB_BUFFER_OFFSET)
        ORU_CL_ERROR(CL_EXEC_STATUS_ERROR_FOR_EVENTS_IN_WAIT_LIST)
        ORU_CL_ERROR(CL_COMPILE_PROGRAM_FAILURE)
        ORU_CL_ERROR(CL_LINKER_NOT_AVAILABLE)
        ORU_CL_ERROR(CL_LINK_PROGRAM_FAILURE)
        ORU_CL_ERROR(CL_DEVICE_PARTITION_FAILED)
        ORU_CL_ERROR(CL_KERNEL_ARG_INFO_NOT_AVAILABLE)
        ORU_CL_ERROR(CL_INVALID_GLOBAL_WORK_SIZE)
        ORU_CL_ERROR(CL_INVALID_PROPERTY)
        ORU_CL_ERROR(CL_INVALID_IMAGE_DESCRIPTOR)
        ORU_CL_ERROR(CL_INVALID_COMPILER_OPTIONS)
        ORU_CL_ERROR(CL_INVALID_LINKER_OPTIONS)
        ORU_CL_ERROR(CL_INVALID_DEVICE_PARTITION_COUNT)
        ORU_CL_ERROR(CL_INVALID_PIPE_SIZE)
        ORU_CL_ERROR(CL_INVALID_DEVICE_QUEUE)
        ORU_CL_ERROR(CL_INVALID_SPEC_ID)
        ORU_CL_ERROR(CL_MAX_SIZE_RESTRICTION_EXCEEDED)
        ORU_CL_ERROR(CL_INVALID_GL_SHAREGROUP_REFERENCE_KHR)
        ORU_CL_ERROR(CL_PLATFORM_NOT_FOUND_KHR)
#undef ORU_CL_ERROR
    default:
        return nullptr;
    }
}

} // namespace

void ThrowOCL(char const *file, unsigned int line, cl_int code) {
    throw ExceptionOCL(file, line, "", static_cast<unsigned int>(code));
}

void ThrowOCL(char const *file, unsigned int line, cl_int code, char const *function) {
    std::string note = ComposeText("in ", function);
    if (std::string_view(ExceptionOCL::ErrorToCString(code)) == "UNKNOWN CL ERROR CODE") {
        char const *const name = LaterErrorName(code);
        note += ComposeText(", ", name ? name : "code", ' ', code);
    }
    throw ORU_private::Noted(ExceptionOCL(file, line, "", static_cast<unsigned int>(code)), note);
}

} // namespace ORU::OCL
