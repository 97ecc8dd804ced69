// The root of the library's exception classes.
#include "oru/core/exceptions/exceptionbase.h"

#include "oru/core/memory/orumemory.h"

#include <ostream>

namespace ORU {

ExceptionBase::ExceptionBase() : ExceptionBase("ORU exception") {}

ExceptionBase::ExceptionBase(char const *text) : what_(text) {}

ExceptionBase::~ExceptionBase() = default;

char const *ExceptionBase::what() const noexcept {
    return what_.c_str();
}

ExceptionBase *ExceptionBase::clone() const {
    return ORU_NEW ExceptionBase(*this);
}

void ExceptionBase::write(std::ostream &os) const {
    os << what();
}

std::ostream &operator<<(std::ostream &os, ExceptionBase const &e) {
    e.write(os);
    return os;
}

} // namespace ORU
