// The catalogue: its order, its names, and the group loaders against what the driver exports.
#include "tests/support/glfixture.h"
#include "tests/support/tablerows.h"

#include <cstring>

using namespace ORU::OGL;

namespace {

constexpr std::size_t kEntryCount = sizeof(FunctionTable) / sizeof(PROC);

/// An entry point, its group, its prototype.
std::vector<std::vector<std::string>> const &Rows() {
    static auto const kRows = oru_test::TableRows(ORU_ENTRY_POINTS);
    return kRows;
}

#if defined(__GNUC__)
/// The slot that a pointer to a virtual operation calls, read from its representation in this ABI.
template<class Operation>
std::size_t SlotOf(Operation operation) {
    std::ptrdiff_t words[2];
    std::memcpy(words, &operation, sizeof operation);
    return static_cast<std::size_t>(words[0] - 1) / sizeof(void *);
}
#endif

} // namespace

TEST(Catalogue, KeepsItsOrder) {
    std::pair<std::size_t, char const *> const places[] = {
        {129, "glIndexMask"},         {131, "glIndexd"},     {335, "glViewport"},
        {336, "glDrawRangeElements"}, {606, "glGetStringi"}, {636, "glCopyBufferSubData"},
        {1181, "glVertexWeighthvNV"}};
    for (auto const &[place, name] : places)
        EXPECT_EQ(name, Rows().at(place)[0]);
    std::size_t const first = Rows().size() - kEntryCount; // beyond OpenGL 1.1
    for (std::size_t i = 0; i < Rows().size(); ++i)
        EXPECT_EQ(i < first, Rows()[i][1] == "GL_VERSION_1_1") << i;
#if defined(__GNUC__)
    // In an array: an assertion for each operation would take the compiler minutes.
    std::pair<std::string, std::size_t> const operations[] = {
#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    {"gl" #Name, SlotOf(&OpenGLInterceptor::cgm##Name)},
#include "oru/oru_ogl/extensionator/gloperations.inc"
    };
    ASSERT_EQ(Rows().size(), std::size(operations));
    for (std::size_t i = 0; i < Rows().size(); ++i)
        EXPECT_EQ(std::pair(Rows()[i][0], i), operations[i]);
#endif
}

class LoaderTest : public oru_test::OffscreenTest {};

TEST_F(LoaderTest, StoresWhatTheDriverExports) {
    ExtensionManager &record = *ExtensionManager::Instance();
    std::size_t const first = Rows().size() - kEntryCount;
    std::map<unsigned int, bool> allFound;
    for (std::size_t i = first; i < Rows().size(); ++i) {
        bool &found =
            allFound.emplace(record.nameToEnumGL(Rows()[i][1].c_str()), true).first->second;
        found = found && ::wglGetProcAddress(Rows()[i][0].c_str());
    }
    for (unsigned int value = 0; value <= UNKNOWN_OPENGL_EXTENSION; ++value) {
        auto const group = allFound.find(value);
        bool const loads =
            group == allFound.end() ? value <= GL_SGIS_GENERATE_MIPMAP : group->second;
        EXPECT_EQ(loads, record.initializeGL(static_cast<OpenGLExtension>(value))) << value;
    }

    EXPECT_EQ(UNKNOWN_OPENGL_EXTENSION, record.nameToEnumGL("GL_ARB_imagin"));

    // Every loader ran: each entry, found or not, is what the platform answers.
    PROC entries[kEntryCount];
    std::memcpy(entries, &record.table(), sizeof entries);
    for (std::size_t i = first; i < Rows().size(); ++i)
        EXPECT_EQ(::wglGetProcAddress(Rows()[i][0].c_str()), entries[i - first]) << Rows()[i][0];
}
