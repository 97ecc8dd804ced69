// A program's binary with what tells whose it is and whether it is whole.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace ORU::OGL::internal {

/// What glGetProgramBinary gives and glProgramBinary takes.
struct ProgramCode {
    unsigned int format;
    void const *bytes;
    std::size_t size;
};

/// What tells the current context's driver from all others, and from itself in another version.
std::string DriverText();

/// The code behind a header, the driver's text and a checksum.
std::vector<unsigned char> PackProgram(ProgramCode const &code, std::string const &driver);

/// The code within what PackProgram made for the same driver; nothing for all else. Its bytes are
/// the caller's.
std::optional<ProgramCode> UnpackProgram(void const *bytes, std::size_t size,
                                         std::string const &driver);

} // namespace ORU::OGL::internal
