// What a record reads from implementations that differ: the build runs this program under Mesa's
// overrides. ORU_TEST_VERSION and ORU_TEST_VENDOR say what the record must find, ORU_TEST_RUNGS
// which capabilities the versions bring.
#include "tests/support/failure.h"
#include "tests/support/glfixture.h"
#include "tests/support/implementation.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

#include <cstddef>
#include <cstdlib>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

std::string Environment(char const *name) {
    char const *const value = std::getenv(name);
    return value ? value : "";
}

} // namespace

class LadderTest : public OffscreenTest {
protected:
    ExtensionManager &record() { return *ExtensionManager::Instance(); }
};

TEST_F(LadderTest, HoldsEveryVersionUpToItsOwn) {
    std::string const overridden = Environment("ORU_TEST_VERSION");
    EXPECT_EQ(overridden.substr(0, 3), overridden.empty() ? "" : Text(GL_VERSION).substr(0, 3));
    auto const version = static_cast<unsigned int>(Version());
    EXPECT_EQ(version / 10, record().majorVersion());
    EXPECT_EQ(version > 41 ? 1 : version % 10, record().minorVersion());
    EXPECT_NE(std::string::npos, record().additionalVersionInfo().find("Mesa"));
    EXPECT_FAILURE(record().hasReleaseVersion() ? "" : "releaseVersion_ != -1",
                   record().releaseVersion());

    // By the enumerator of the version; no implementation reaches the one of 1.2.1.
    unsigned int const numbers[] = {12, 99, 13, 14, 15, 20, 21, 30, 31, 32, 33, 40, 41};
    for (unsigned int value = GL_VERSION_1_2; value <= GL_VERSION_4_1; ++value)
        EXPECT_EQ(version >= numbers[value],
                  record().isSupported(static_cast<OpenGLExtension>(value)))
            << value;

    // A version brings capabilities that no extension string need name: numbers, and the names that
    // came with them, nearly none of which the implementation names here.
    std::istringstream rungs(Environment("ORU_TEST_RUNGS"));
    unsigned int rung = 0, unnamed = 0;
    for (std::string word; rungs >> word;) {
        if (word[0] != 'G') {
            rung = static_cast<unsigned int>(std::stoi(word));
            continue;
        }
        bool const named = Has(word);
        unnamed += named ? 0 : 1;
        EXPECT_EQ(version >= rung || named,
                  record().isSupported(record().nameToEnumGL(word.c_str())))
            << word;
    }
    EXPECT_TRUE(version < 30 || unnamed >= 30) << "the overrides take only " << unnamed << " out";
}

TEST_F(LadderTest, KeepsEveryNameOfTheImplementation) {
    auto const expected = ExtensionNames();
    auto const &names = record().supportedExtensionNames();
    auto const firstWGL = names.begin() + static_cast<std::ptrdiff_t>(expected.size());
    ASSERT_GT(names.size(), expected.size()) << "the WGL extensions follow";
    EXPECT_EQ(expected, std::vector<std::string>(names.begin(), firstWGL));
    EXPECT_TRUE(std::all_of(firstWGL, names.end(),
                            [](std::string const &name) { return name.substr(0, 4) == "WGL_"; }));
    EXPECT_TRUE(record().isSupported(WGL_ARB_PIXEL_FORMAT));
    for (std::string const &name : expected) {
        OpenGLExtension const e = record().nameToEnumGL(name.c_str());
        EXPECT_EQ(record().initializeGL(e), record().isSupported(e)) << name;
    }
}

TEST_F(LadderTest, KnowsItsMaker) {
    EXPECT_EQ(Environment("ORU_TEST_VENDOR"), record().vendorString());
    ASSERT_FALSE(Has("GL_ARB_texture_non_power_of_two"));
    EXPECT_EQ(Version() >= 20 && record().vendor() != ExtensionManager::VENDOR_NVIDIA,
              record().supportsNonPowerOfTwoTextures());
    GLint units = 1;
    ::glGetIntegerv(record().isSupported(GL_ARB_FRAGMENT_PROGRAM) ? GL_MAX_TEXTURE_IMAGE_UNITS
                                                                  : GL_MAX_TEXTURE_UNITS,
                    &units);
    EXPECT_EQ(static_cast<unsigned int>(units), record().numberOfTextureUnits());
}

TEST_F(LadderTest, AnswersWithoutAnyCallForFloatsThatItLacks) {
    bool const hasFloats = !Environment("ORU_TEST_VERSION").empty();
    ASSERT_EQ(hasFloats, record().supportsFloatingPointTextures());
    ASSERT_EQ(hasFloats, record().isSupported(GL_EXT_GPU_SHADER4));
    if (hasFloats)
        return;
    InterceptorScope<CountingForwarder> calls;
    for (int i = 0; i < 2; ++i)
        EXPECT_FALSE(record().supportsFloatFiltering() || record().supportsHalfFiltering());
    EXPECT_EQ(0, calls->total());
}

TEST_F(LadderTest, PrintsVersionsAndNames) {
    std::ostringstream text, expected;
    text << record();
    expected << "ExtensionManager for context version " << record().majorVersion() << '.'
             << record().minorVersion() << "\n                        glsl version "
             << std::stoi(Text(GL_SHADING_LANGUAGE_VERSION)) << '.' << record().glslMinorVersion()
             << "\nSupported extensions:\n";
    for (std::string const &name : record().supportedExtensionNames())
        expected << "    " << name << '\n';
    EXPECT_EQ(expected.str(), text.str());
}
