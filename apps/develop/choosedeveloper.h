// Which way to develop on this machine.
#pragma once

#include "apps/develop/developer.h"

#include <memory>
#include <string>

namespace ORU::OGL {
class Context;
} // namespace ORU::OGL

namespace Develop {

class OpenCLRuntime;

/// The best way to sharpen among others: by OpenGL, sharpening by OpenCL on a device that shares
/// with it; else all by OpenCL on a GPU, else on any device; else all by OpenGL.
/// @param wish "PLATFORM.DEVICE" by numbers, a part of their names, or "none" for no OpenCL; the
///        best when empty
/// @param context the current OpenGL context
/// @throws Failure when no device is what is wished
std::unique_ptr<Developer> ChooseDeveloper(OpenCLRuntime const &runtime, std::string const &wish,
                                           ORU::OGL::Context const &context);

} // namespace Develop
