// What a failure says in a report.
#include "apps/oruinfo/failuretext.h"

#include "oru/core/exceptions/logicalexception.h"
#include "oru/oru_ocl/exceptionocl.h"

#include <sstream>

namespace OruInfo {

std::string FullText(std::exception const &failure) {
    std::ostringstream text;
    if (auto const *const known = dynamic_cast<ORU::ExceptionBase const *>(&failure))
        text << *known;
    else
        text << failure.what();
    return text.str();
}

std::string ShortText(std::exception const &failure) {
    auto const *const known = dynamic_cast<ORU::LogicalException const *>(&failure);
    if (!known)
        return failure.what();
    bool const isOpenCL = dynamic_cast<ORU::OCL::ExceptionOCL const *>(known) != nullptr;
    std::string const text = isOpenCL ? known->what() : known->message();
    return *known->note() ? text + " " + known->note() : text;
}

} // namespace OruInfo
