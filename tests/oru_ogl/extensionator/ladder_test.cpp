// What a record reads from implementations of several versions; the build runs this program under
// Mesa's overrides, and ORU_TEST_VERSION or ORU_TEST_MISSING says which.
#include "../glfixture.h"

#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

#include <algorithm>
#include <cstdlib>
#include <sstream>
#include <vector>

using namespace ORU::OGL;
using oru_test::OffscreenTest;

namespace {

/// The names in the extension string of old versions or the indexed query of newer ones.
std::vector<std::string> NamesByThePlainCalls() {
    std::vector<std::string> names;
    std::string const version = reinterpret_cast<char const *>(::glGetString(GL_VERSION));
    if (version[0] < '3') {
        std::istringstream text(reinterpret_cast<char const *>(::glGetString(GL_EXTENSIONS)));
        for (std::string name; text >> name;)
            names.push_back(name);
        return names;
    }
    auto const getStringi = reinterpret_cast<PFNGLGETSTRINGIPROC>(
        reinterpret_cast<void *>(::wglGetProcAddress("glGetStringi")));
    GLint count = 0;
    ::glGetIntegerv(GL_NUM_EXTENSIONS, &count);
    for (GLint i = 0; i < count; ++i)
        names.push_back(
            reinterpret_cast<char const *>(getStringi(GL_EXTENSIONS, static_cast<GLuint>(i))));
    return names;
}

} // namespace

class LadderTest : public OffscreenTest {
protected:
    ExtensionManager &record() { return *ExtensionManager::Instance(); }
};

TEST_F(LadderTest, HoldsEveryVersionUpToItsOwn) {
    std::string const text = reinterpret_cast<char const *>(::glGetString(GL_VERSION));
    if (char const *expected = std::getenv("ORU_TEST_VERSION")) {
        EXPECT_EQ(text.substr(0, 3), std::string(expected).substr(0, 3)) << "the override works";
    }
    unsigned int const major = static_cast<unsigned int>(text[0] - '0');
    unsigned int const minor = static_cast<unsigned int>(text[2] - '0');
    EXPECT_EQ(major, record().majorVersion());
    EXPECT_EQ(major == 4 ? std::min(minor, 1u) : minor, record().minorVersion());
    EXPECT_FALSE(record().hasReleaseVersion() && record().releaseVersion() > 1000);
    EXPECT_NE(std::string::npos, record().additionalVersionInfo().find("Mesa"));

    std::pair<unsigned int, OpenGLExtension> const versions[] = {
        {12, GL_VERSION_1_2}, {13, GL_VERSION_1_3}, {14, GL_VERSION_1_4}, {15, GL_VERSION_1_5},
        {20, GL_VERSION_2_0}, {21, GL_VERSION_2_1}, {30, GL_VERSION_3_0}, {31, GL_VERSION_3_1},
        {32, GL_VERSION_3_2}, {33, GL_VERSION_3_3}, {40, GL_VERSION_4_0}, {41, GL_VERSION_4_1}};
    for (auto const &version : versions)
        EXPECT_EQ(major * 10 + minor >= version.first, record().isSupported(version.second))
            << version.first;
    EXPECT_FALSE(record().isSupported(GL_VERSION_1_2_1)) << "no rung adds it";

    // What comes with a version only: no extension string names it, or not in this version.
    EXPECT_EQ(major * 10 + minor >= 40 ||
                  std::count(record().supportedExtensionNames().begin(),
                             record().supportedExtensionNames().end(), "GL_ARB_gpu_shader5") > 0,
              record().isSupported(GL_ARB_GPU_SHADER5));
}

TEST_F(LadderTest, KeepsEveryNameOfTheImplementation) {
    auto const expected = NamesByThePlainCalls();
    auto const &names = record().supportedExtensionNames();
    ASSERT_GE(names.size(), expected.size());
    EXPECT_TRUE(std::equal(expected.begin(), expected.end(), names.begin()));
    ASSERT_GT(names.size(), expected.size()) << "the WGL extensions follow";
    for (std::size_t i = expected.size(); i < names.size(); ++i)
        EXPECT_EQ(0u, names[i].find("WGL_")) << names[i];
    EXPECT_TRUE(record().isSupported(WGL_ARB_PIXEL_FORMAT));

    for (std::string const &name : expected) {
        OpenGLExtension const e = record().nameToEnumGL(name.c_str());
        if (e != UNKNOWN_OPENGL_EXTENSION) {
            EXPECT_EQ(record().initializeGL(e), record().isSupported(e)) << name;
        }
    }
}

TEST_F(LadderTest, AnswersItsShortcutsFromTheSet) {
    auto const has = [this](OpenGLExtension e) { return record().isSupported(e); };
    EXPECT_EQ(has(GL_ARB_TEXTURE_NON_POWER_OF_TWO) || has(GL_VERSION_2_0),
              record().supportsNonPowerOfTwoTextures());
    GLint units = 1;
    ::glGetIntegerv(
        has(GL_ARB_FRAGMENT_PROGRAM) ? GL_MAX_TEXTURE_IMAGE_UNITS : GL_MAX_TEXTURE_UNITS, &units);
    EXPECT_EQ(static_cast<unsigned int>(units), record().numberOfTextureUnits());
    std::string const glsl =
        reinterpret_cast<char const *>(::glGetString(GL_SHADING_LANGUAGE_VERSION));
    EXPECT_EQ(0u, glsl.find(std::to_string(record().glslMajorVersion()) + "."));
    if (!record().hasReleaseVersion()) {
        EXPECT_THROW(record().releaseVersion(), ORU::InternalException);
    }
}

TEST_F(LadderTest, LacksWhatTheImplementationLacks) {
    char const *const missing = std::getenv("ORU_TEST_MISSING");
    if (!missing)
        return; // this run removes none
    auto const &names = record().supportedExtensionNames();
    EXPECT_EQ(0, std::count(names.begin(), names.end(), missing));
    OpenGLExtension const e = ExtensionManager::Instance()->nameToEnumGL(missing);
    ASSERT_NE(UNKNOWN_OPENGL_EXTENSION, e);
    EXPECT_FALSE(record().isSupported(e));
    EXPECT_FALSE(record().isSupported(GL_VERSION_3_0)) << "the version that needs it";
}

TEST_F(LadderTest, PrintsVersionsAndNames) {
    std::ostringstream text, expected;
    text << record();
    expected << "ExtensionManager for context version " << record().majorVersion() << '.'
             << record().minorVersion() << "\n                        glsl version "
             << record().glslMajorVersion() << '.' << record().glslMinorVersion()
             << "\nSupported extensions:\n";
    for (std::string const &name : record().supportedExtensionNames())
        expected << "    " << name << '\n';
    EXPECT_EQ(expected.str(), text.str());
}
