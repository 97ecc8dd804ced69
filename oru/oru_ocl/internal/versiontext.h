// The version that a platform names.
#pragma once

#include <cstddef>
#include <cstring>
#include <string>

namespace ORU::OCL {

struct Version {
    unsigned int major = 0;
    unsigned int minor = 0;
};

/// The version in "OpenCL <major>.<minor> …", one digit each; 0.0 for an empty text.
/// @throws std::out_of_range for a text shorter than "OpenCL "
inline Version ParseVersion(std::string const &text) {
    if (text.empty())
        return {};
    std::string const digits = text.substr(std::strlen("OpenCL "), 3);
    auto const digit = [&digits](std::size_t i) {
        bool const is = i < digits.size() && digits[i] >= '0' && digits[i] <= '9';
        return is ? static_cast<unsigned int>(digits[i] - '0') : 0;
    };
    return {digit(0), digit(2)};
}

} // namespace ORU::OCL
