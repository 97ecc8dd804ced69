// The exception of a failed OpenCL call.
#include "oru/oru_ocl/exceptionocl.h"

#include "oru/core/memory/orumemory.h"

#include <iterator>

namespace ORU::OCL {

namespace {

/// The codes 0, -1, -2 and so on.
constexpr char const *runtimeErrors[] = {
    "CL_SUCCESS",
    "CL_DEVICE_NOT_FOUND",
    "CL_DEVICE_NOT_AVAILABLE",
    "CL_COMPILER_NOT_AVAILABLE",
    "CL_MEM_OBJECT_ALLOCATION_FAILURE",
    "CL_OUT_OF_RESOURCES",
    "CL_OUT_OF_HOST_MEMORY",
    "CL_PROFILING_INFO_NOT_AVAILABLE",
    "CL_MEM_COPY_OVERLAP",
    "CL_IMAGE_FORMAT_MISMATCH",
    "CL_IMAGE_FORMAT_NOT_SUPPORTED",
    "CL_BUILD_PROGRAM_FAILURE",
    "CL_MAP_FAILURE",
};

/// The codes from -30 on.
constexpr char const *argumentErrors[] = {
    "CL_INVALID_VALUE",           "CL_INVALID_DEVICE_TYPE",
    "CL_INVALID_PLATFORM",        "CL_INVALID_DEVICE",
    "CL_INVALID_CONTEXT",         "CL_INVALID_QUEUE_PROPERTIES",
    "CL_INVALID_COMMAND_QUEUE",   "CL_INVALID_HOST_PTR",
    "CL_INVALID_MEM_OBJECT",      "CL_INVALID_IMAGE_FORMAT_DESCRIPTOR",
    "CL_INVALID_IMAGE_SIZE",      "CL_INVALID_SAMPLER",
    "CL_INVALID_BINARY",          "CL_INVALID_BUILD_OPTIONS",
    "CL_INVALID_PROGRAM",         "CL_INVALID_PROGRAM_EXECUTABLE",
    "CL_INVALID_KERNEL_NAME",     "CL_INVALID_KERNEL_DEFINITION",
    "CL_INVALID_KERNEL",          "CL_INVALID_ARG_INDEX",
    "CL_INVALID_ARG_VALUE",       "CL_INVALID_ARG_SIZE",
    "CL_INVALID_KERNEL_ARGS",     "CL_INVALID_WORK_DIMENSION",
    "CL_INVALID_WORK_GROUP_SIZE", "CL_INVALID_WORK_ITEM_SIZE",
    "CL_INVALID_GLOBAL_OFFSET",   "CL_INVALID_EVENT_WAIT_LIST",
    "CL_INVALID_EVENT",           "CL_INVALID_OPERATION",
    "CL_INVALID_GL_OBJECT",       "CL_INVALID_BUFFER_SIZE",
    "CL_INVALID_MIP_LEVEL",
};
constexpr int firstArgumentError = -30;

static_assert(std::size(runtimeErrors) == 13 && std::size(argumentErrors) == 33);

} // namespace

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
    auto const name = [code](auto const &names, int first) -> char const * {
        // A code above the first wraps to a large index.
        std::size_t const index = static_cast<std::size_t>(first) - static_cast<std::size_t>(code);
        return index < std::size(names) ? names[index] : nullptr;
    };
    if (char const *const text = name(runtimeErrors, 0))
        return text;
    if (char const *const text = name(argumentErrors, firstArgumentError))
        return text;
    return "UNKNOWN CL ERROR CODE";
}

} // namespace ORU::OCL
