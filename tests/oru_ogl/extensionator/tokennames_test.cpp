// The names of OpenGL values against the table of constants that they come from.
#include "oru/oru_ogl/extensionator/opengltokenname.h"

#include "tests/support/tablerows.h"

#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>

TEST(TokenNames, AreThoseOfTheLatestVersion) {
    // By value: the names with their OpenGL version, 0 for those of extensions alone.
    std::map<GLenum, std::map<std::string, double>> constants;
    auto const valueOf = [](auto const &row) {
        return static_cast<GLenum>(std::stoul(row[0], nullptr, 16));
    };
    for (auto const &row : oru_test::TableRows(ORU_TOKENS))
        if (row[2] != "GL_ARB_fragment_program") // constants of no call
            constants[valueOf(row)][row[1]] = row[2] < "A" ? std::stod(row[2]) : 0;
    std::map<GLenum, std::string> choices; // names of another version, which hosts read in traces
    for (auto const &row : oru_test::TableRows(ORU_TOKEN_CHOICES))
        choices[valueOf(row)] = row[1];
    std::set<GLenum> values;
    for (GLenum value = 0; value < 0x12000; ++value)
        values.insert(value);
    for (unsigned int bit = 16; bit < 32; ++bit)
        values.insert({1u << bit, (1u << bit) + 1, (1u << bit) - 1});
    for (auto const &constant : constants)
        values.insert(constant.first);

    for (GLenum const value : values) {
        std::string const name = ORUOGLTokenName(value);
        auto const found = constants.find(value);
        if (found == constants.end()) {
            ASSERT_EQ("Unknown Token", name) << value;
            continue;
        }
        auto const &names = found->second;
        ASSERT_EQ(1u, names.count(name)) << name << " has not the value " << value;
        auto const latest = std::max_element(names.begin(), names.end(),
                                             [](auto &a, auto &b) { return a.second < b.second; });
        if (choices.count(value))
            EXPECT_EQ(choices[value], name);
        else
            EXPECT_EQ(latest->second, names.at(name)) << name << " is not " << latest->first;
    }
}

TEST(TokenNames, AreExportedUnmangled) {
    HMODULE const library = ::GetModuleHandleA("oru.dll");
    EXPECT_TRUE(::GetProcAddress(library, "ORUOGLTokenName"));
    EXPECT_TRUE(::GetProcAddress(library, "ORUOGLBoolToString"));
}
