// The one place where a failed check throws.
#include "oru/core/exceptions/checks.h"

namespace ORU_private {

void ThrowInternal(char const *file, int line, char const *message) {
    throw ORU::InternalException(file, line, message);
}

void ThrowInternal(char const *file, int line, std::string const &message) {
    ThrowInternal(file, line, message.c_str());
}

void ThrowInternalNoted(char const *file, int line, std::string const &message,
                        std::string const &note) {
    throw Noted(ORU::InternalException(file, line, message.c_str()), note);
}

} // namespace ORU_private
