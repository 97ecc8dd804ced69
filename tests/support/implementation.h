// What the current context says of itself, read with plain calls.
#pragma once

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <iterator>
#include <sstream>
#include <vector>

namespace oru_test {

inline std::string Text(GLenum name) {
    return reinterpret_cast<char const *>(::glGetString(name));
}

/// The version as one number, 15 for 1.5.
inline int Version() {
    std::string const text = Text(GL_VERSION);
    return (text[0] - '0') * 10 + (text[2] - '0');
}

/// The names in the extension string of old versions or the indexed query of newer ones.
inline std::vector<std::string> ExtensionNames() {
    if (Version() < 30) {
        std::istringstream text(Text(GL_EXTENSIONS));
        return {std::istream_iterator<std::string>(text), {}};
    }
    GLint count = 0;
    ::glGetIntegerv(GL_NUM_EXTENSIONS, &count);
    std::vector<std::string> names;
    for (GLuint i = 0; i < static_cast<GLuint>(count); ++i)
        names.push_back(reinterpret_cast<char const *>(ORU_GL(GetStringi, GL_EXTENSIONS, i)));
    return names;
}

inline bool Has(std::string const &extension) {
    auto const names = ExtensionNames();
    return std::count(names.begin(), names.end(), extension) > 0;
}

} // namespace oru_test
