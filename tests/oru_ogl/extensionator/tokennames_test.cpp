// The names of OpenGL values against the table of constants that they come from.
#include "oru/oru_ogl/extensionator/opengltokenname.h"

#include "tests/support/tablerows.h"

#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>
#include <string>

namespace {

/// Names that are not of the latest version that names the value, which hosts read in traces.
std::map<GLenum, std::string> const kChosen = {{0x0000, "GL_POINTS"},
                                               {0x0001, "GL_CURRENT_BIT"},
                                               {0x0002, "GL_POINT_BIT"},
                                               {0x0004, "GL_LINE_BIT"},
                                               {0x0008, "GL_POLYGON_BIT"},
                                               {0x0100, "GL_ACCUM"},
                                               {0x0200, "GL_NEVER"},
                                               {0x0400, "GL_STENCIL_BUFFER_BIT"},
                                               {0x0800, "GL_VIEWPORT_BIT"},
                                               {0x1000, "GL_TRANSFORM_BIT"},
                                               {0x4000, "GL_COLOR_BUFFER_BIT"},
                                               {0x140B, "GL_HALF_APPLE"},
                                               {0x85B5, "GL_VERTEX_ARRAY_BINDING_APPLE"},
                                               {0x8CA6, "GL_DRAW_FRAMEBUFFER_BINDING"}};

} // namespace

TEST(TokenNames, AreThoseOfTheLatestVersion) {
    // By value: the names with their OpenGL version, 0 for those of extensions alone.
    std::map<GLenum, std::map<std::string, double>> constants;
    for (auto const &row : oru_test::TableRows(ORU_TOKENS))
        constants[static_cast<GLenum>(std::stoul(row[0], nullptr, 16))][row[1]] =
            row[2] < "A" ? std::stod(row[2]) : 0;
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
        auto const latest = std::max_element(names.begin(), names.end(),
                                             [](auto &a, auto &b) { return a.second < b.second; });
        if (auto const chosen = kChosen.find(value); chosen != kChosen.end())
            EXPECT_EQ(chosen->second, name);
        else
            EXPECT_EQ(latest->second, names.at(name)) << name << " is not " << latest->first;
    }
    EXPECT_EQ(1476, named);
}

TEST(TokenNames, OfBooleans) {
    for (int value = 0; value < 256; ++value)
        EXPECT_STREQ(value ? "GL_TRUE" : "GL_FALSE",
                     ORUOGLBoolToString(static_cast<GLboolean>(value)));
}

TEST(TokenNames, AreExportedUnmangled) {
    HMODULE const library = ::GetModuleHandleA("oru.dll");
    EXPECT_TRUE(::GetProcAddress(library, "ORUOGLTokenName"));
    EXPECT_TRUE(::GetProcAddress(library, "ORUOGLBoolToString"));
}
