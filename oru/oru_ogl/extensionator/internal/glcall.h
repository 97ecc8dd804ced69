// The short form of OpenGL calls in the library itself.
#pragma once

#include "oru/oru_ogl/extensionator/internal/librarycalls.h"

/// `ORU_GL(BindTexture, target, id)` calls glBindTexture through the chain with this source
/// position.
#define ORU_GL(Name, ...) ::ORU::OGL::internal::Call##Name(__FILE__, __LINE__, __VA_ARGS__)

/// `ORU_GL0(Flush)`: the same for the few functions without arguments.
#define ORU_GL0(Name) ::ORU::OGL::internal::Call##Name(__FILE__, __LINE__)
