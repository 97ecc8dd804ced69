// The catalogue's names, generated from its tables.
#pragma once

#include <cstddef>

namespace ORU::OGL {

/// Number of entry points in a FunctionTable, and of capabilities in OpenGLExtension.
std::size_t const kEntryPointCount = 846;
std::size_t const kExtensionCount = 113;

/// The names of the FunctionTable's entry points, in its order.
extern char const *const kEntryPointNames[kEntryPointCount];

/// The exact extension string of each OpenGLExtension value.
extern char const *const kExtensionStrings[kExtensionCount];

} // namespace ORU::OGL
