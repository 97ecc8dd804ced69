// The translations of the library's enumerations to OpenGL's values and back.
#pragma once

#include "tests/support/failure.h"

#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/platformgl.h"

#include <sstream>
#include <string>

namespace oru_test {

/// Both ways through an enumeration, and what lies outside of it.
/// @param name as the failures have it
/// @param values OpenGL's names in the order of the enumeration, without GL_
template<class Enumeration>
void ExpectTranslation(std::string const &name, unsigned int (*toGL)(Enumeration),
                       Enumeration (*fromGL)(unsigned int), std::string const &values) {
    std::istringstream words(values);
    unsigned int count = 0;
    for (std::string word; words >> word; ++count) {
        unsigned int const gl = toGL(static_cast<Enumeration>(count));
        EXPECT_EQ("GL_" + word, ORUOGLTokenName(gl));
        EXPECT_EQ(count, fromGL(gl));
    }
    std::string const failure = "!\"" + name + " enums are not all properly translated.\"";
    EXPECT_FAILURE(failure, toGL(static_cast<Enumeration>(count)));
    EXPECT_FAILURE(failure, fromGL(GL_NONE));
}

} // namespace oru_test
