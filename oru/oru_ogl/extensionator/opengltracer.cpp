// A decorator that writes a line of text for each OpenGL call; the operations are generated.
#include "oru/oru_ogl/extensionator/opengltracer.h"

namespace ORU::OGL {

OpenGLTracer::OpenGLTracer(std::ostream &os, OpenGLInterceptor *next)
    : OpenGLInterceptorDecorator(next), stream_(&os) {}

OpenGLTracer::~OpenGLTracer() = default;

} // namespace ORU::OGL
