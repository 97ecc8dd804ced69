// The catalogue: its order, its names, and the group loaders against what the driver exports.
#include "tests/support/glfixture.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

#include <cstddef>
#include <cstring>
#include <fstream>
#include <sstream>
#include <utility>
#include <vector>

using namespace ORU::OGL;

namespace {

std::size_t const kCoreCount = 336;

/// (entry point, group) in catalogue order, read from the table itself.
std::vector<std::pair<std::string, std::string>> Rows() {
    std::vector<std::pair<std::string, std::string>> rows;
    std::ifstream file(ORU_ENTRY_POINTS);
    for (std::string line; std::getline(file, line);) {
        std::string name, group;
        std::istringstream(line) >> name >> group;
        if (name[0] != '#')
            rows.emplace_back(name, group);
    }
    return rows;
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
    std::pair<std::size_t, char const *> const places[] = {
        {129, "glIndexMask"},         {131, "glIndexd"},     {335, "glViewport"},
        {336, "glDrawRangeElements"}, {606, "glGetStringi"}, {636, "glCopyBufferSubData"}};
    for (auto const &place : places)
        EXPECT_EQ(place.second, rows[place.first].first);
#if defined(__GNUC__)
    EXPECT_EQ(1181u, SlotOf(&OpenGLInterceptor::cgmVertexWeighthvNV));
#endif
}

class LoaderTest : public oru_test::OffscreenTest {};

TEST_F(LoaderTest, StoresWhatTheDriverExports) {
    ExtensionManager &record = *ExtensionManager::Instance();
    auto const rows = Rows();
    std::map<unsigned int, bool> allFound;
    for (std::size_t i = kCoreCount; i < rows.size(); ++i) {
        OpenGLExtension const e = record.nameToEnumGL(rows[i].second.c_str());
        bool const found = ::wglGetProcAddress(rows[i].first.c_str());
        allFound[e] = allFound.emplace(e, true).first->second && found;
    }
    ASSERT_EQ(62u, allFound.size());
    for (unsigned int value = 0; value <= UNKNOWN_OPENGL_EXTENSION; ++value) {
        auto const group = allFound.find(value);
        bool const loads =
            group == allFound.end() ? value <= GL_SGIS_GENERATE_MIPMAP : group->second;
        EXPECT_EQ(loads, record.initializeGL(static_cast<OpenGLExtension>(value))) << value;
    }

    // Every loader ran: each entry, found or not, is what the platform answers.
    PROC entries[846];
    std::memcpy(entries, &record.table(), sizeof entries);
    for (std::size_t i = kCoreCount; i < rows.size(); ++i)
        EXPECT_EQ(::wglGetProcAddress(rows[i].first.c_str()), entries[i - kCoreCount])
            << rows[i].first;
}

TEST_F(LoaderTest, KnowsExactNames) {
    EXPECT_EQ(34, ExtensionManager::Instance()->nameToEnumGL("GL_ARB_imaging"));
    for (char const *name : {"gl_arb_imaging", "GL_ARB_imagin", "GL_ARB_imaging ", "",
                             "WGL_ARB_pbuffer", "GL_ARB_compute_shader"})
        EXPECT_EQ(UNKNOWN_OPENGL_EXTENSION, ExtensionManager::Instance()->nameToEnumGL(name))
            << name;
}
