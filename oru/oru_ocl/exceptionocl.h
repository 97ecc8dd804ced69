// The exception of a failed OpenCL call.
#pragma once

#include "oru/core/exceptions/logicalexception.h"

namespace ORU::OCL {

/// An OpenCL call that returned an error code, with the source position of the call.
class ORU_API ExceptionOCL : public LogicalException {
public:
    /// Parameters as for `LogicalException`.
    /// @param error the code as the runtime returned it, a negative `cl_int` bit for bit
    ExceptionOCL(char const *file, unsigned int line, char const *message, unsigned int error);

    ExceptionOCL(ExceptionOCL const &) = default;
    ExceptionOCL &operator=(ExceptionOCL const &) = default;
    ~ExceptionOCL() override;

    /// The error description.
    char const *what() const noexcept override;

    /// "OCL Exception: " and the name of the code.
    std::string const &errorDescription() const { return errorDescription_; }

    /// The code; `static_cast<int>` of it is the CL_* constant.
    unsigned int errorNumber() const { return errorNumber_; }

    ExceptionBase *clone() const override;

    /// The constant's name of an OpenCL 1.0 error code, "UNKNOWN CL ERROR CODE" for any other.
    static char const *ErrorToCString(int code);

private:
    unsigned int errorNumber_;
    std::string errorDescription_;
};

} // namespace ORU::OCL
