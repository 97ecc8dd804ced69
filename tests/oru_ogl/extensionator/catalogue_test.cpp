// The catalogue: its order, its names, and the group loaders against what the driver exports.
#include "../glfixture.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/openglerrorchecker.h"

#include <cstddef>
#include <cstring>
#include <fstream>
#include <sstream>
#include <utility>
#include <vector>

using namespace ORU::OGL;
using oru_test::OffscreenTest;

namespace {

/// (group, entry point) in catalogue order, read from the table itself.
std::vector<std::pair<std::string, std::string>> Rows() {
    std::vector<std::pair<std::string, std::string>> rows;
    std::ifstream file(ORU_ENTRY_POINTS);
    for (std::string line; std::getline(file, line);) {
        if (line.empty() || line[0] == '#')
            continue;
        std::string name, group;
        std::istringstream(line) >> name >> group;
        rows.emplace_back(group, name);
    }
    return rows;
}

PROC Entry(FunctionTable const &table, std::size_t index) {
    PROC address;
    std::memcpy(&address, reinterpret_cast<char const *>(&table) + index * sizeof address,
                sizeof address);
    return address;
}

#if defined(__GNUC__)
/// The slot that a pointer to a virtual operation calls, read from its representation in this ABI.
template<class Operation>
std::size_t SlotOf(Operation operation) {
    std::ptrdiff_t words[2];
    static_assert(sizeof words == sizeof operation, "pointer to member of this ABI");
    std::memcpy(words, &operation, sizeof words);
    return static_cast<std::size_t>(words[0] - 1) / sizeof(void *);
}
#endif

} // namespace

TEST(Catalogue, KeepsItsOrder) {
    auto const rows = Rows();
    ASSERT_EQ(1182u, rows.size());
    char const *const operations[] = {
#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments) "gl" #Name,
#include "oru/oru_ogl/extensionator/gloperations.inc"
    };
    for (std::size_t i = 0; i < rows.size(); ++i)
        ASSERT_EQ(rows[i].second, operations[i]) << i;
    EXPECT_EQ(rows.size(), sizeof operations / sizeof *operations);
    EXPECT_EQ("glViewport", rows[335].second);
    EXPECT_EQ(846 * sizeof(void *), sizeof(FunctionTable));
    EXPECT_EQ(270 * sizeof(void *), offsetof(FunctionTable, glGetStringi));
    EXPECT_EQ(300 * sizeof(void *), offsetof(FunctionTable, glCopyBufferSubData));
#if defined(__GNUC__)
    EXPECT_EQ(0u, SlotOf(&OpenGLInterceptor::cgmAccum));
    EXPECT_EQ(606u, SlotOf(&OpenGLInterceptor::cgmGetStringi));
    EXPECT_EQ(1181u, SlotOf(&OpenGLInterceptor::cgmVertexWeighthvNV));
#endif
}

class LoaderTest : public OffscreenTest {};

TEST_F(LoaderTest, StoresWhatTheDriverExports) {
    ExtensionManager &record = *ExtensionManager::Instance();
    auto const rows = Rows();
    std::map<std::string, bool> allFound;
    for (std::size_t i = 336; i < rows.size(); ++i) {
        auto const known = allFound.emplace(rows[i].first, true).first;
        known->second = known->second && ::wglGetProcAddress(rows[i].second.c_str());
    }
    ASSERT_EQ(62u, allFound.size());

    int without = 0;
    for (unsigned int value = 0; value <= GL_SGIS_GENERATE_MIPMAP; ++value) {
        auto const e = static_cast<OpenGLExtension>(value);
        bool const result = record.initializeGL(e);
        // The string of a value is not exported; its name in the other direction is.
        bool named = false;
        for (auto const &group : allFound)
            if (record.nameToEnumGL(group.first.c_str()) == e) {
                EXPECT_EQ(group.second, result) << group.first;
                named = true;
            }
        if (!named) {
            EXPECT_TRUE(result) << value;
            ++without;
        }
    }
    EXPECT_EQ(40, without);
    EXPECT_FALSE(record.initializeGL(WGL_ARB_PBUFFER));
    EXPECT_FALSE(record.initializeGL(UNKNOWN_OPENGL_EXTENSION));

    // Every loader ran: each entry, found or not, is what the platform answers.
    for (std::size_t i = 336; i < rows.size(); ++i)
        EXPECT_EQ(::wglGetProcAddress(rows[i].second.c_str()), Entry(record.table(), i - 336))
            << rows[i].second;
}

TEST_F(LoaderTest, KnowsExactNames) {
    EXPECT_EQ(34, GL_ARB_IMAGING);
    for (char const *name : {"gl_arb_imaging", "GL_ARB_imagin", "GL_ARB_imaging ", "",
                             "WGL_ARB_pbuffer", "GL_ARB_compute_shader"})
        EXPECT_EQ(UNKNOWN_OPENGL_EXTENSION, ExtensionManager::Instance()->nameToEnumGL(name))
            << name;
}
