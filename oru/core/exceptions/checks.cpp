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
    ORU::InternalException failure(file, line, message.c_str());
    failure.addNote(note);
    throw failure;
}

} // namespace ORU_private
