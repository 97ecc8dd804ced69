// The code of the page on compilers.
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/version.h"

#include <gtest/gtest.h>

#include <string>

// [require]
#if ORU_VERSION < 100 // 0.1.0
#error "this host needs ORU 0.1"
#endif
// [require]

TEST(Compilers, KnowsNamesAndVersions) {
    // [names]
    char const *name = ORUOGLTokenName(0x0DE1); // "GL_TEXTURE_2D"
    // [names]
    EXPECT_STREQ("GL_TEXTURE_2D", name);
    // [version]
    bool const same = std::string(ORU::Version()) == ORU_VERSION_STRING; // the DLL's, the headers'
    // [version]
    EXPECT_TRUE(same);
}
