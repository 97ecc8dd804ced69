// A program's binary with what tells whose it is and whether it is whole.
#include "oru/oru_ogl/ogl/internal/programs/programbinary.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>
#include <numeric>
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

std::uint64_t Mix(std::uint64_t sum, std::uint64_t word) {
    return (sum ^ word) * 1099511628211u;
}

/// FNV-1a of 64 bits, of words of 8 bytes instead of single ones, in four lanes that do not wait
/// for each other; zeros follow the last word.
std::uint64_t Checksum(std::string_view bytes) {
    constexpr std::uint64_t kBasis = 14695981039346656037u;
    std::array<std::uint64_t, 4> sums = {kBasis, kBasis, kBasis, kBasis}, words = {};
    auto const mixBlock = [&] {
        for (std::size_t lane = 0; lane < words.size(); ++lane)
            sums[lane] = Mix(sums[lane], words[lane]);
    };
    for (; bytes.size() >= sizeof words; bytes.remove_prefix(sizeof words)) {
        std::memcpy(words.data(), bytes.data(), sizeof words);
        mixBlock();
    }
    words.fill(0);
    std::memcpy(words.data(), bytes.data(), bytes.size());
    mixBlock();
    return std::accumulate(sums.begin(), sums.end(), kBasis, Mix);
}

} // namespace

std::string DriverText() {
    std::string text;
    text.reserve(256); // allocated once
    constexpr GLenum kNames[] = {GL_VENDOR, GL_RENDERER, GL_VERSION};
    for (GLenum const name : kNames) {
        auto const *const part = reinterpret_cast<char const *>(ORU_GL(GetString, name));
        text.append(part ? part : "").append(1, '\n');
    }
    return text;
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
