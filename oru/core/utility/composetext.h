// Composes a text by streaming its pieces.
#pragma once

#include <locale>
#include <sstream>
#include <string>

namespace ORU {

/// The pieces streamed one after the other with nothing between them, numbers in decimal:
/// `ORU_THROW_INTERNAL(ComposeText("Unknown mode ", mode))`.
template<class... Pieces>
std::string ComposeText(Pieces const &...pieces) {
    std::ostringstream stream;
    // A host's global locale would group the digits ("1,024").
    stream.imbue(std::locale::classic());
    (stream << ... << pieces);
    return stream.str();
}

} // namespace ORU
