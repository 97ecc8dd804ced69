// What one part of a report says of a machine agrees with what another one says, and with Windows.
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "tests/apps/oruinfo/oruinfofixture.h"

#include <set>

#include <windows.h>

using namespace apps_test;
using namespace ORU::OGL;

using Agreement = OruInfoFixture;

TEST_F(Agreement, OfCapabilitiesFormatsAndDisplays) {
    Json const report = reportOf("");
    Json const &capabilities = report["capabilities"];
    std::vector<std::string> const supported = capabilities["supported"];
    std::vector<std::string> names = supported, all;
    for (Json const &row : capabilities["missing"])
        names.push_back(row["name"]);
    for (unsigned int e = 0; e < UNKNOWN_OPENGL_EXTENSION; ++e)
        all.push_back(ExtensionManager::ExtensionEnumToString(static_cast<OpenGLExtension>(e)));
    EXPECT_THAT(names, testing::UnorderedElementsAreArray(all));

    // Two ways of trying whether textures are filtered.
    Json const &formats = report["formats"]["formats"];
    Json const floats = Row(formats, "GL_RGBA32F");
    EXPECT_EQ(std::count(supported.begin(), supported.end(), "GL_ARB_texture_float") > 0,
              floats["is_texture"]);
    EXPECT_EQ(Row(report["filtering"]["probes"], "32-bit floats")["is_filtered"],
              floats["is_filtered"]);
    Json const bytes = Row(formats, "GL_RGBA8");
    EXPECT_TRUE(bytes["is_texture"] && bytes["is_renderable"] && bytes["is_filtered"]);
    EXPECT_EQ(report["limits"]["max_samples"], bytes["samples"]);
    EXPECT_EQ(true, Row(formats, "GL_DEPTH_COMPONENT24")["is_renderable"]);
    EXPECT_EQ(false, Row(formats, "GL_RGB9_E5")["is_renderable"]);

    std::set<int> numbers;
    std::size_t count = 0, inFamilies = 0;
    for (Json const &format : report["pixel_formats"]["formats"]) {
        count += format["numbers"].size();
        numbers.insert(format["numbers"].begin(), format["numbers"].end());
    }
    for (Json const &family : report["pixel_formats"]["summary"])
        inFamilies += family["formats"].get<std::size_t>();
    EXPECT_EQ(report["pixel_formats"]["count"], count);
    EXPECT_EQ(numbers.size(), count);
    EXPECT_EQ(inFamilies, count);

    Json const output = Row(report["displays"]["outputs"], report["opengl"]["output"]);
    EXPECT_EQ(::GetSystemMetrics(SM_CXSCREEN), output["width"]["value"]);
    EXPECT_EQ(::GetSystemMetrics(SM_CYSCREEN), output["height"]["value"]);
}
