// Program binaries in their wrapping: whole, and for the same driver, or not at all.
#include "oru/oru_ogl/ogl/internal/programs/programbinary.h"

#include <gtest/gtest.h>

#include <string>

using namespace ORU::OGL::internal;

namespace {

std::string CodeOf(std::vector<unsigned char> const &packed, std::size_t size,
                   std::string const &driver) {
    auto const code = UnpackProgram(packed.data(), size, driver);
    if (!code)
        return "refused";
    return std::to_string(code->format) +
           std::string(static_cast<char const *>(code->bytes), code->size);
}

} // namespace

TEST(ProgramBinary, IsWholeAndItsDriversOrRefused) {
    std::string const driver = "vendor\nrenderer\n4.5";
    for (std::string const code : {"", "code"}) {
        auto packed = PackProgram({0x875F, code.data(), code.size()}, driver);
        auto const size = packed.size();
        EXPECT_EQ(std::to_string(0x875F) + code, CodeOf(packed, size, driver));
        for (std::string const other :
             {"vendor\nrenderer\n4.6", "vendor\nrenderer\n4.", "vendor", ""})
            EXPECT_EQ("refused", CodeOf(packed, size, other)) << other;
        for (std::size_t i = 0; i < size; ++i) {
            EXPECT_EQ("refused", CodeOf(packed, i, driver)) << "cut off at " << i;
            packed[i] ^= 0x10;
            EXPECT_EQ("refused", CodeOf(packed, size, driver)) << "changed at " << i;
            packed[i] ^= 0x10;
        }
        packed.push_back(0);
        EXPECT_EQ("refused", CodeOf(packed, packed.size(), driver)) << "with something behind it";
    }
    EXPECT_FALSE(UnpackProgram(nullptr, 100, driver));
}
