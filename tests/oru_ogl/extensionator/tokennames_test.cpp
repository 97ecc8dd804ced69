// The names of OpenGL values against the table of constants that they come from.
#include "oru/oru_ogl/extensionator/opengltokenname.h"

#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <utility>

namespace {

/// Every constant by its value, with whether it is one of an OpenGL version.
std::map<GLenum, std::map<std::string, bool>> ReadConstants() {
    std::map<GLenum, std::map<std::string, bool>> result;
    std::ifstream table(ORU_TOKENS);
    for (std::string line; std::getline(table, line);) {
        std::string value, name, origin;
        std::istringstream(line) >> value >> name >> origin;
        if (value[0] != '#')
            result[static_cast<GLenum>(std::stoul(value, nullptr, 16))][name] = origin < "A";
    }
    return result;
}

} // namespace

TEST(TokenNames, AreThoseOfTheConstantsAndCoreOnesFirst) {
    auto const constants = ReadConstants();
    std::set<GLenum> values;
    for (GLenum value = 0; value < 0x12000; ++value)
        values.insert(value);
    for (unsigned int bit = 16; bit < 32; ++bit)
        values.insert({1u << bit, (1u << bit) + 1, (1u << bit) - 1});
    for (auto const &constant : constants)
        values.insert(constant.first);

    int named = 0;
    for (GLenum const value : values) {
        std::string const name = ORUOGLTokenName(value);
        auto const found = constants.find(value);
        if (found == constants.end() || (value >= 0x8804 && value <= 0x8810)) {
            ASSERT_EQ("Unknown Token", name) << value;
            continue;
        }
        ++named;
        auto const &names = found->second;
        ASSERT_EQ(1u, names.count(name)) << name << " has not the value " << value;
        bool const hasCoreName = std::any_of(names.begin(), names.end(),
                                             [](auto const &constant) { return constant.second; });
        if (hasCoreName && value != 0x140B && value != 0x85B5) {
            EXPECT_TRUE(names.at(name)) << name;
        }
    }
    EXPECT_EQ(1476, named);
}

TEST(TokenNames, OfSharedValuesAndBooleans) {
    std::pair<GLenum, char const *> const rows[] = {{0x0000, "GL_POINTS"},
                                                    {0x0001, "GL_CURRENT_BIT"},
                                                    {0x0004, "GL_LINE_BIT"},
                                                    {0x0100, "GL_ACCUM"},
                                                    {0x0400, "GL_STENCIL_BUFFER_BIT"},
                                                    {0x4000, "GL_COLOR_BUFFER_BIT"},
                                                    {0x140B, "GL_HALF_APPLE"},
                                                    {0x85B5, "GL_VERTEX_ARRAY_BINDING_APPLE"},
                                                    {0x8CA6, "GL_DRAW_FRAMEBUFFER_BINDING"}};
    for (auto const &row : rows)
        EXPECT_STREQ(row.second, ORUOGLTokenName(row.first));
    for (int value = 0; value < 256; ++value)
        EXPECT_STREQ(value ? "GL_TRUE" : "GL_FALSE",
                     ORUOGLBoolToString(static_cast<GLboolean>(value)));
}

TEST(TokenNames, AreExportedUnmangled) {
    HMODULE const library = ::GetModuleHandleA("oru.dll");
    EXPECT_TRUE(::GetProcAddress(library, "ORUOGLTokenName"));
    EXPECT_TRUE(::GetProcAddress(library, "ORUOGLBoolToString"));
}
