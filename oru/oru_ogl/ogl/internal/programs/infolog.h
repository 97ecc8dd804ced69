// The log of a shader or program body as a text.
#pragma once

#include <string>

namespace ORU::OGL::internal {

/// The log of `length` bytes, its final zero among them, up to the first zero.
template<class Body>
std::string ReadInfoLog(Body &body, int length) {
    std::string log(static_cast<std::string::size_type>(length), '\0');
    body.getInfoLog(length, &log[0]);
    log.resize(log.find('\0') == std::string::npos ? log.size() : log.find('\0'));
    return log;
}

} // namespace ORU::OGL::internal
