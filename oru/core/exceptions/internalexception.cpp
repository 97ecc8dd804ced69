// The exception of a failed check.
#include "oru/core/exceptions/internalexception.h"

#include "oru/core/memory/orumemory.h"

namespace ORU {

InternalException::InternalException() : InternalException(nullptr, 0, nullptr) {}

InternalException::InternalException(char const *file, int line, char const *message)
    : LogicalException(file, line, message) {
    setWhat("ORU Internal exception");
}

InternalException::~InternalException() = default;

ExceptionBase *InternalException::clone() const {
    return ORU_NEW InternalException(*this);
}

} // namespace ORU
