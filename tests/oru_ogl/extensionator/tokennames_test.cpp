// The names of OpenGL values against the table of constants that they come from.
#include "oru/oru_ogl/extensionator/opengltokenname.h"

#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <map>
#include <sstream>
#include <string>

namespace {

/// Every constant by its value, with whether it is one of an OpenGL version.
using Constants = std::map<GLenum, std::map<std::string, bool>>;

Constants const &ReadConstants() {
    static Constants const constants = [] {
        Constants result;
        std::ifstream table(ORU_TOKENS);
        for (std::string line; std::getline(table, line);) {
            std::string value, name, origin;
            std::istringstream(line) >> value >> name >> origin;
            if (value[0] != '#')
                result[static_cast<GLenum>(std::stoul(value, nullptr, 16))][name] =
                    origin[0] >= '1' && origin[0] <= '9';
        }
        return result;
    }();
    return constants;
}

bool HasVendorSuffix(std::string const &name) {
    char const *const suffixes[] = {"_ARB", "_EXT", "_NV", "_APPLE", "_ATI", "_SGIS"};
    return std::count(std::begin(suffixes), std::end(suffixes), name.substr(name.rfind('_'))) > 0;
}

} // namespace

TEST(TokenNames, CoverTheConstantsWithCoreNamesFirst) {
    std::map<GLenum, std::string> const exceptions = {{0x140B, "GL_HALF_APPLE"},
                                                      {0x85B5, "GL_VERTEX_ARRAY_BINDING_APPLE"}};
    int named = 0;
    for (auto const &entry : ReadConstants()) {
        std::string const name = ORUOGLTokenName(entry.first);
        if (entry.first >= 0x8804 && entry.first <= 0x8810) {
            EXPECT_EQ("Unknown Token", name) << entry.first;
            continue;
        }
        ++named;
        ASSERT_EQ(1u, entry.second.count(name)) << name << " has not the value " << entry.first;
        bool core = false;
        for (auto const &constant : entry.second)
            core = core || constant.second;
        auto const exception = exceptions.find(entry.first);
        if (exception != exceptions.end()) {
            EXPECT_EQ(exception->second, name);
        } else if (core) {
            EXPECT_TRUE(entry.second.at(name) && !HasVendorSuffix(name)) << name;
        }
    }
    EXPECT_EQ(1476, named);
}

TEST(TokenNames, NameNothingElse) {
    Constants const &constants = ReadConstants();
    for (GLenum value = 0; value < 0x12000; ++value)
        if (!constants.count(value)) {
            ASSERT_STREQ("Unknown Token", ORUOGLTokenName(value)) << value;
        }
    for (unsigned int bit = 16; bit < 32; ++bit)
        for (GLenum const value : {1u << bit, (1u << bit) + 1, (1u << bit) - 1})
            if (!constants.count(value)) {
                EXPECT_STREQ("Unknown Token", ORUOGLTokenName(value)) << value;
            }
}

// Of the names that share a value the first one's.
TEST(TokenNames, OfSharedValues) {
    std::map<GLenum, char const *> const rows = {{0x0000, "GL_POINTS"},
                                                 {0x0001, "GL_CURRENT_BIT"},
                                                 {0x0004, "GL_LINE_BIT"},
                                                 {0x0100, "GL_ACCUM"},
                                                 {0x0400, "GL_STENCIL_BUFFER_BIT"},
                                                 {0x4000, "GL_COLOR_BUFFER_BIT"},
                                                 {0x8A0F, "GL_COLOR_FLOAT_APPLE"},
                                                 {0x8B40, "GL_PROGRAM_OBJECT_ARB"},
                                                 {0x8CA6, "GL_DRAW_FRAMEBUFFER_BINDING"},
                                                 {0x8D40, "GL_FRAMEBUFFER"}};
    for (auto const &row : rows)
        EXPECT_STREQ(row.second, ORUOGLTokenName(row.first));
    for (int value = 0; value < 256; ++value)
        EXPECT_STREQ(value ? "GL_TRUE" : "GL_FALSE",
                     ORUOGLBoolToString(static_cast<GLboolean>(value)));
}

TEST(TokenNames, AreExportedUnmangled) {
    HMODULE const library = ::GetModuleHandleA("oru.dll");
    ASSERT_TRUE(library);
    EXPECT_TRUE(::GetProcAddress(library, "ORUOGLTokenName"));
    EXPECT_TRUE(::GetProcAddress(library, "ORUOGLBoolToString"));
}
