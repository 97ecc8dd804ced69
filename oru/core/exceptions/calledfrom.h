// Which call of the host's led to a failure.
#pragma once

#include "oru/core/exceptions/logicalexception.h"

/// Evaluates an expression; a failure of the library in it gets a note of this place of the source:
///
/// ```cpp
/// ORU_FROM_HERE(program.link(true));
/// ```
///
/// `file()` and `line()` of a failing class operation name the library's own call of OpenGL or
/// OpenCL; the note, which streaming the exception shows too, names the host's. Nested ones add a
/// note each, the innermost first. Costs nothing until something fails.
#define ORU_FROM_HERE(...)                                                                         \
    ::ORU_private::CallFrom(__FILE__, __LINE__, [&]() -> decltype(auto) { return __VA_ARGS__; })

namespace ORU_private {

/// Adds "called from FILE:LINE" to what `call` throws.
template<class Call>
decltype(auto) CallFrom(char const *file, unsigned int line, Call &&call) {
    try {
        return call();
    } catch (ORU::LogicalException &failure) {
        failure.addNote(std::string("called from ") + file + ':' + std::to_string(line));
        throw;
    }
}

} // namespace ORU_private
