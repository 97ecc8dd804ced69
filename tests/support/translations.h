// The translations of the library's enumerations to OpenGL's values and back.
#pragma once

#include "tests/support/failure.h"

#include "oru/oru_ogl/platformgl.h"

#include <string>

namespace oru_test {

/// Both ways through an enumeration of `count` values, and what lies outside of it. Each value
/// comes back, so no two have the same GL value.
template<class Enumeration>
void ExpectTranslation(std::string const &name, unsigned int (*toGL)(Enumeration),
                       Enumeration (*fromGL)(unsigned int), unsigned int count, GLenum last) {
    for (unsigned int i = 0; i < count; ++i)
        EXPECT_EQ(i, fromGL(toGL(static_cast<Enumeration>(i)))) << name;
    EXPECT_EQ(last, toGL(static_cast<Enumeration>(count - 1)));
    std::string const failure = "!\"" + name + " enums are not all properly translated.\"";
    EXPECT_FAILURE(failure, toGL(static_cast<Enumeration>(count)));
    EXPECT_FAILURE(failure, fromGL(GL_NONE));
}

} // namespace oru_test
