// Which way to sharpen on this machine.
#pragma once

#include "apps/develop/sharpener.h"

#include <memory>
#include <string>

namespace ORU::OGL {
class Context;
} // namespace ORU::OGL

namespace Develop {

class OpenCLRuntime;

/// The best way: OpenCL on a device that shares with OpenGL, else on a GPU, else on any device,
/// else GLSL.
/// @param wish "PLATFORM.DEVICE" by numbers, a part of their names, or "none" for no OpenCL; the
///        best when empty
/// @param context the current OpenGL context
/// @throws Failure when no device is what is wished
std::unique_ptr<Sharpener> ChooseSharpener(OpenCLRuntime const &runtime, std::string const &wish,
                                           ORU::OGL::Context const &context);

} // namespace Develop
