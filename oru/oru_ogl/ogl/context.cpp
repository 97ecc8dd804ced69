// The base of every OpenGL rendering context: what it holds.
#include "oru/oru_ogl/ogl/context.h"

namespace ORU::OGL {

bool Context::sThrowTestException_ = false;

Context::Context(HGLRC renderContext)
    : initOptions_(ExtensionManager::CurrentInitOptions()), renderContext_(renderContext) {}

Context::Context(DisplayDeviceKey const &key)
    : displayDeviceKey_(key), initOptions_(ExtensionManager::CurrentInitOptions()) {}

Context::~Context() = default;

} // namespace ORU::OGL
