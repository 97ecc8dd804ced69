// A program's binary with what tells whose it is and whether it is whole.
#include "oru/oru_ogl/ogl/internal/programs/programbinary.h"

#include "oru/oru_ogl/ogl/oruopengl.h"
#include "oru/oru_ogl/platformgl.h"

#include <cstdint>
#include <cstring>
#include <string_view>

namespace ORU::OGL::internal {

namespace {

/// What stands before the driver's text and the code.
struct Header {
    char mark[8];
    std::uint64_t checksum; ///< of all that follows it
    std::uint64_t driverSize;
    std::uint64_t codeSize;
    std::uint64_t format;
};

constexpr char kMark[] = "ORUPROG1";

/// What the checksum is of.
std::string_view Checked(unsigned char const *bytes, std::size_t size) {
    std::size_t const from = offsetof(Header, driverSize);
    return {reinterpret_cast<char const *>(bytes) + from, size - from};
}

/// FNV-1a of 64 bits.
std::uint64_t Checksum(std::string_view bytes) {
    std::uint64_t sum = 14695981039346656037u;
    for (char const byte : bytes)
        sum = (sum ^ static_cast<unsigned char>(byte)) * 1099511628211u;
    return sum;
}

} // namespace

std::string DriverText() {
    return GetGLString(GL_VENDOR) + '\n' + GetGLString(GL_RENDERER) + '\n' +
           GetGLString(GL_VERSION);
}

std::vector<unsigned char> PackProgram(ProgramCode const &code, std::string const &driver) {
    Header header = {{}, 0, driver.size(), code.size, code.format};
    std::memcpy(header.mark, kMark, sizeof header.mark);
    std::vector<unsigned char> packed(sizeof header + driver.size() + code.size);
    std::memcpy(packed.data(), &header, sizeof header);
    std::memcpy(packed.data() + sizeof header, driver.data(), driver.size());
    if (code.size > 0)
        std::memcpy(packed.data() + sizeof header + driver.size(), code.bytes, code.size);
    header.checksum = Checksum(Checked(packed.data(), packed.size()));
    std::memcpy(packed.data(), &header, sizeof header);
    return packed;
}

std::optional<ProgramCode> UnpackProgram(void const *bytes, std::size_t size,
                                         std::string const &driver) {
    Header header;
    if (!bytes || size < sizeof header + driver.size())
        return {};
    auto const *const packed = static_cast<unsigned char const *>(bytes);
    std::memcpy(&header, packed, sizeof header);
    std::size_t const codeSize = size - sizeof header - driver.size();
    if (std::memcmp(header.mark, kMark, sizeof header.mark) != 0 ||
        header.driverSize != driver.size() || header.codeSize != codeSize ||
        std::memcmp(packed + sizeof header, driver.data(), driver.size()) != 0 ||
        header.checksum != Checksum(Checked(packed, size)))
        return {};
    return ProgramCode{static_cast<unsigned int>(header.format),
                       packed + sizeof header + driver.size(), codeSize};
}

} // namespace ORU::OGL::internal
