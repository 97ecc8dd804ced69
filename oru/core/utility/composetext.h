// Composes a text by streaming its pieces.
#pragma once

#include "oru/core/exceptions/checks.h"

#include <locale>
#include <sstream>
#include <string>

namespace ORU {

/// The pieces streamed one after the other with nothing between them, numbers in decimal:
/// `ComposeText("Unknown mode ", mode)`.
template<class... Pieces>
std::string ComposeText(Pieces const &...pieces) {
    std::ostringstream stream;
    // A host's global locale would group the digits ("1,024").
    stream.imbue(std::locale::classic());
    (stream << ... << pieces);
    return stream.str();
}

} // namespace ORU

namespace ORU_private {

/// Throws `InternalException` with a composed text, for ORU_THROW_INTERNAL. The pieces come as
/// values: by reference, the caller would have to keep its variables in memory for a failure that
/// hardly ever comes.
template<class First, class Second, class... More>
[[noreturn]] ORU_COLD void ThrowInternal(char const *file, int line, First first, Second second,
                                         More... more) {
    ThrowInternal(file, line, ORU::ComposeText(first, second, more...));
}

} // namespace ORU_private
