// The one place where a failed OpenCL call throws.
#include "oru/oru_ocl/clcall.h"

#include "oru/oru_ocl/exceptionocl.h"

namespace ORU::OCL {

void ThrowOCL(char const *file, unsigned int line, cl_int code) {
    throw ExceptionOCL(file, line, "", static_cast<unsigned int>(code));
}

} // namespace ORU::OCL
