// The one place where a failed check throws.
#include "oru/core/exceptions/checks.h"

namespace ORU_private {

void ThrowInternal(char const *file, int line, char const *message) {
    throw ORU::InternalException(file, line, message);
}

void ThrowInternal(char const *file, int line, std::string const &message) {
    ThrowInternal(file, line, message.c_str());
}

} // namespace ORU_private
