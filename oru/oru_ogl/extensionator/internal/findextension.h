// Looks a capability up by the name that a driver lists.
#pragma once

#include "oru/oru_ogl/extensionator/internal/catalogueogl.h"

#include <algorithm>
#include <cstddef>
#include <cstring>
#include <iterator>

namespace ORU::OGL {

/// The capability of an exact name, or UNKNOWN_OPENGL_EXTENSION.
template<std::size_t Count>
OpenGLExtension FindExtension(NamedExtension const (&extensions)[Count], char const *name) {
    auto const *const found = std::lower_bound(
        std::begin(extensions), std::end(extensions), name,
        [](NamedExtension const &e, char const *text) { return std::strcmp(e.name, text) < 0; });
    bool const equal = found != std::end(extensions) && !std::strcmp(found->name, name);
    return equal ? found->value : UNKNOWN_OPENGL_EXTENSION;
}

} // namespace ORU::OGL
