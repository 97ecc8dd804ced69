// The names of OpenGL values against the table of constants that they come from.
#include "oru/oru_ogl/extensionator/opengltokenname.h"

#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

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
    std::string const suffix = name.substr(name.rfind('_'));
    return suffix == "_ARB" || suffix == "_EXT" || suffix == "_NV" || suffix == "_APPLE" ||
           suffix == "_ATI" || suffix == "_SGIS";
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

TEST(TokenNames, OfSharedValues) {
    std::vector<std::pair<GLenum, char const *>> const rows = {
        {0x0000, "GL_POINTS"},
        {0x0001, "GL_CURRENT_BIT"},
        {0x0002, "GL_POINT_BIT"},
        {0x0003, "GL_LINE_STRIP"},
        {0x0004, "GL_LINE_BIT"},
        {0x0008, "GL_POLYGON_BIT"},
        {0x0100, "GL_ACCUM"},
        {0x0200, "GL_NEVER"},
        {0x0400, "GL_STENCIL_BUFFER_BIT"},
        {0x0404, "GL_FRONT"},
        {0x0405, "GL_BACK"},
        {0x0800, "GL_VIEWPORT_BIT"},
        {0x1000, "GL_TRANSFORM_BIT"},
        {0x4000, "GL_COLOR_BUFFER_BIT"},
        {0x8000, "GL_HINT_BIT"},
        {0x20000000, "GL_MULTISAMPLE_BIT"},
        {0x1400, "GL_BYTE"},
        {0x1702, "GL_TEXTURE"},
        {0x0DE1, "GL_TEXTURE_2D"},
        {0x84C0, "GL_TEXTURE0"},
        {0x8872, "GL_MAX_TEXTURE_IMAGE_UNITS"},
        {0x8892, "GL_ARRAY_BUFFER"},
        {0x8A0F, "GL_COLOR_FLOAT_APPLE"},
        {0x8B40, "GL_PROGRAM_OBJECT_ARB"},
        {0x8CA6, "GL_DRAW_FRAMEBUFFER_BINDING"},
        {0x8CD9, "GL_FRAMEBUFFER_INCOMPLETE_DIMENSIONS_EXT"},
        {0x8D40, "GL_FRAMEBUFFER"},
    };
    for (auto const &row : rows)
        EXPECT_STREQ(row.second, ORUOGLTokenName(row.first));
}

TEST(TokenNames, OfBooleans) {
    EXPECT_STREQ("GL_FALSE", ORUOGLBoolToString(0));
    for (int value = 1; value < 256; ++value)
        EXPECT_STREQ("GL_TRUE", ORUOGLBoolToString(static_cast<GLboolean>(value)));
}

TEST(TokenNames, AreExportedUnmangled) {
    HMODULE const library = ::GetModuleHandleA("oru.dll");
    ASSERT_TRUE(library);
    EXPECT_TRUE(::GetProcAddress(library, "ORUOGLTokenName"));
    EXPECT_TRUE(::GetProcAddress(library, "ORUOGLBoolToString"));
}
