// What a record reads under Mesa's overrides: ORU_TEST_VERSION and ORU_TEST_VENDOR say what it must
// find, ORU_TEST_RUNGS which capabilities the versions bring.
#include "tests/support/implementation.h"
#include "tests/support/objecttest.h"

#include <cstdlib>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

std::string Environment(char const *name) {
    char const *const value = std::getenv(name);
    return value ? value : "";
}

} // namespace

struct LadderTest : OffscreenTest {
    ExtensionManager &record() { return *ExtensionManager::Instance(); }
};

TEST_F(LadderTest, HoldsEveryVersionUpToItsOwn) {
    std::string const overridden = Environment("ORU_TEST_VERSION");
    EXPECT_EQ(overridden.substr(0, 3), overridden.empty() ? "" : Text(GL_VERSION).substr(0, 3));
    auto const version = static_cast<unsigned int>(Version());
    EXPECT_EQ(version / 10, record().majorVersion());
    EXPECT_EQ(version > 41 ? 1 : version % 10, record().minorVersion());

    // By enumerator; no implementation reaches the one of 1.2.1.
    unsigned int const numbers[] = {12, 99, 13, 14, 15, 20, 21, 30, 31, 32, 33, 40, 41};
    for (unsigned int value = GL_VERSION_1_2; value <= GL_VERSION_4_1; ++value)
        EXPECT_EQ(version >= numbers[value],
                  record().isSupported(static_cast<OpenGLExtension>(value)))
            << value;

    // Then the names that came with them, nearly none of which the implementation names.
    std::istringstream rungs(Environment("ORU_TEST_RUNGS"));
    unsigned int rung = 0, unnamed = 0;
    for (std::string word; rungs >> word;) {
        if (word[0] != 'G') {
            rung = static_cast<unsigned int>(std::stoi(word));
        } else {
            unnamed += Has(word) ? 0u : 1u;
            EXPECT_EQ(version >= rung || Has(word),
                      record().isSupported(record().nameToEnumGL(word.c_str())))
                << word;
        }
    }
    EXPECT_TRUE(version < 30 || unnamed >= 30) << "the overrides take only " << unnamed << " out";
}

TEST_F(LadderTest, KeepsEveryNameOfTheImplementation) {
    auto const expected = ExtensionNames();
    auto names = record().supportedExtensionNames();
    EXPECT_EQ(0u, names.at(expected.size()).find("WGL_")) << "those of WGL follow";
    names.resize(expected.size());
    EXPECT_EQ(expected, names);
    for (std::string const &name : expected) {
        OpenGLExtension const e = record().nameToEnumGL(name.c_str());
        EXPECT_EQ(record().initializeGL(e), record().isSupported(e)) << name;
    }
}

// What is missing is not reported, or reported without an entry point.
TEST_F(LadderTest, KnowsWhatIsReportedAndWhatItLacks) {
    for (unsigned int value = 0; value < UNKNOWN_OPENGL_EXTENSION; ++value) {
        auto const e = static_cast<OpenGLExtension>(value);
        std::string const name = ExtensionManager::ExtensionEnumToString(e);
        EXPECT_EQ(value < WGL_ARB_CREATE_CONTEXT ? e : UNKNOWN_OPENGL_EXTENSION,
                  record().nameToEnumGL(name.c_str()));
        bool const isThere = record().isReported(e) && record().missingEntryPoints(e).empty();
        EXPECT_EQ(record().isSupported(e), isThere) << name;
    }
    EXPECT_TRUE(record().isReported(GL_APPLE_FLUSH_RENDER));
    EXPECT_EQ(
        (std::vector<std::string>{"glFlushRenderAPPLE", "glFinishRenderAPPLE", "glSwapAPPLE"}),
        record().missingEntryPoints(GL_APPLE_FLUSH_RENDER));
    EXPECT_EQ("", ExtensionManager::ExtensionEnumToString(UNKNOWN_OPENGL_EXTENSION));
}

TEST_F(LadderTest, KnowsItsMaker) {
    EXPECT_EQ(Environment("ORU_TEST_VENDOR"), record().vendorString());
    ASSERT_FALSE(Has("GL_ARB_texture_non_power_of_two"));
    EXPECT_EQ(Version() >= 20 && record().vendor() != ExtensionManager::VENDOR_NVIDIA,
              record().supportsNonPowerOfTwoTextures());
    bool const hasPrograms = record().isSupported(GL_ARB_FRAGMENT_PROGRAM);
    EXPECT_EQ(Get(hasPrograms ? GL_MAX_TEXTURE_IMAGE_UNITS : GL_MAX_TEXTURE_UNITS),
              static_cast<GLint>(record().numberOfTextureUnits()));
}

TEST_F(LadderTest, AnswersWithoutAnyCallForFloatsThatItLacks) {
    bool const hasFloats = !Environment("ORU_TEST_VERSION").empty();
    ASSERT_EQ(hasFloats, record().supportsFloatingPointTextures());
    InterceptorScope<CountingForwarder> calls;
    EXPECT_FALSE(!hasFloats &&
                 (record().supportsFloatFiltering() || record().supportsHalfFiltering()));
    EXPECT_EQ(0, calls->total());
}

TEST_F(LadderTest, PrintsVersionsAndNames) {
    std::ostringstream text, expected;
    text << record();
    expected << "ExtensionManager for context version " << record().majorVersion() << '.'
             << record().minorVersion() << "\n                        glsl version "
             << std::stoi(Text(GL_SHADING_LANGUAGE_VERSION)) << '.' << record().glslMinorVersion()
             << "\nSupported extensions:\n    " << record().supportedExtensionNames()[0] << '\n';
    EXPECT_EQ(0u, text.str().find(expected.str()));
}
