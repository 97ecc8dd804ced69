// What a record reads from implementations that differ: the build runs this program under Mesa's
// overrides. ORU_TEST_VERSION and ORU_TEST_VENDOR say what the record must find.
#include "tests/support/failure.h"
#include "tests/support/glfixture.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <iterator>
#include <sstream>
#include <string>
#include <vector>

using namespace ORU::OGL;

namespace {

std::string Text(GLenum name) {
    return reinterpret_cast<char const *>(::glGetString(name));
}

/// The names in the extension string of old versions or the indexed query of newer ones.
std::vector<std::string> Names() {
    std::istringstream text(Text(GL_EXTENSIONS));
    if (Text(GL_VERSION)[0] < '3')
        return {std::istream_iterator<std::string>(text), {}};
    GLint count = 0;
    ::glGetIntegerv(GL_NUM_EXTENSIONS, &count);
    std::vector<std::string> names;
    for (GLuint i = 0; i < static_cast<GLuint>(count); ++i)
        names.push_back(reinterpret_cast<char const *>(ORU_GL(GetStringi, GL_EXTENSIONS, i)));
    return names;
}

bool HasName(std::string const &name) {
    auto const names = Names();
    return std::count(names.begin(), names.end(), name) > 0;
}

} // namespace

class LadderTest : public oru_test::OffscreenTest {
protected:
    ExtensionManager &record() { return *ExtensionManager::Instance(); }
};

TEST_F(LadderTest, HoldsEveryVersionUpToItsOwn) {
    std::string const text = Text(GL_VERSION);
    char const *const overridden = std::getenv("ORU_TEST_VERSION");
    EXPECT_TRUE(!overridden || !std::string(overridden).find(text.substr(0, 3))) << text;
    auto const major = static_cast<unsigned int>(text[0] - '0');
    auto const minor = static_cast<unsigned int>(text[2] - '0');
    EXPECT_EQ(major, record().majorVersion());
    EXPECT_EQ(major == 4 ? std::min(minor, 1u) : minor, record().minorVersion());
    EXPECT_NE(std::string::npos, record().additionalVersionInfo().find("Mesa"));
    EXPECT_EQ(record().hasReleaseVersion() ? "" : "releaseVersion_ != -1",
              oru_test::MessageOf([this] { record().releaseVersion(); }));

    // By the enumerator of the version; no implementation reaches the one of 1.2.1.
    unsigned int const numbers[] = {12, 99, 13, 14, 15, 20, 21, 30, 31, 32, 33, 40, 41};
    for (unsigned int value = GL_VERSION_1_2; value <= GL_VERSION_4_1; ++value)
        EXPECT_EQ(major * 10 + minor >= numbers[value],
                  record().isSupported(static_cast<OpenGLExtension>(value)))
            << value;

    // A version brings capabilities that no extension string need name.
    std::pair<unsigned int, char const *> const brought[] = {
        {30, "GL_ARB_framebuffer_object"},  {31, "GL_ARB_uniform_buffer_object"},
        {32, "GL_ARB_texture_multisample"}, {33, "GL_ARB_timer_query"},
        {40, "GL_ARB_gpu_shader5"},         {41, "GL_ARB_viewport_array"}};
    for (auto const &capability : brought)
        EXPECT_EQ(major * 10 + minor >= capability.first || HasName(capability.second),
                  record().isSupported(record().nameToEnumGL(capability.second)))
            << capability.second;
}

TEST_F(LadderTest, KeepsEveryNameOfTheImplementation) {
    auto const expected = Names();
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
    char const *const vendor = std::getenv("ORU_TEST_VENDOR");
    EXPECT_EQ(vendor ? vendor : "OTHER", record().vendorString());
    ASSERT_FALSE(HasName("GL_ARB_texture_non_power_of_two"));
    EXPECT_EQ(record().isSupported(GL_VERSION_2_0) &&
                  record().vendor() != ExtensionManager::VENDOR_NVIDIA,
              record().supportsNonPowerOfTwoTextures());
    GLint units = 1;
    ::glGetIntegerv(record().isSupported(GL_ARB_FRAGMENT_PROGRAM) ? GL_MAX_TEXTURE_IMAGE_UNITS
                                                                  : GL_MAX_TEXTURE_UNITS,
                    &units);
    EXPECT_EQ(static_cast<unsigned int>(units), record().numberOfTextureUnits());
}

TEST_F(LadderTest, AnswersWithoutAnyCallForFloatsThatItLacks) {
    bool const hasFloats = std::getenv("ORU_TEST_VERSION");
    ASSERT_EQ(hasFloats, record().supportsFloatingPointTextures());
    ASSERT_EQ(hasFloats, record().isSupported(GL_EXT_GPU_SHADER4));
    if (hasFloats)
        return;
    oru_test::Pushed<oru_test::CountingForwarder> calls;
    for (int i = 0; i < 2; ++i) {
        EXPECT_FALSE(record().supportsFloatFiltering());
        EXPECT_FALSE(record().supportsHalfFiltering());
    }
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
