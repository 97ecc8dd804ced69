// The OpenGL that a program works with, without a window.
#include "apps/common/offscreengpu.h"

#include "apps/common/failure.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/interceptorscope.h"
#include "oru/oru_ogl/extensionator/opengltracer.h"
#include "oru/oru_ogl/ogl/oruopengl.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>

namespace App {

using namespace ORU::OGL;

OffscreenGpu::OffscreenGpu(std::string const &traceFile) {
    if (!traceFile.empty()) {
        traceFile_ = std::make_unique<TraceFile>(traceFile);
        tracer_ = std::make_unique<InterceptorScope<OpenGLTracer>>(traceFile_->stream());
    }
    context_ = std::make_unique<ContextOffscreen>();
    context_->makeCurrent();
    ExtensionManager const &record = *ExtensionManager::Instance();
    if (record.majorVersion() < 3)
        throw Failure("OpenGL 3.0 is needed, this is " + GetGLString(GL_VERSION));
    ORU_GL(Disable, GL_DITHER); // results are to be exact
}

OffscreenGpu::~OffscreenGpu() {
    // The context makes calls while it goes, then the tracer leaves the chain.
    context_.reset();
    tracer_.reset();
}

SizeLimit OffscreenGpu::sizeLimit() const {
    GLint texture = 0;
    GLint viewport[2] = {0, 0};
    ORU_GL(GetIntegerv, GL_MAX_TEXTURE_SIZE, &texture);
    ORU_GL(GetIntegerv, GL_MAX_VIEWPORT_DIMS, viewport);
    return SizeLimit{static_cast<std::size_t>(std::min({texture, viewport[0], viewport[1]}))};
}

std::string OffscreenGpu::description() const {
    ExtensionManager const &record = *ExtensionManager::Instance();
    return record.displayDeviceKey().adapterName + ", OpenGL " + GetGLString(GL_VERSION) + ", " +
           GetGLString(GL_RENDERER) + ", " + std::to_string(record.supportedExtensions().size()) +
           " capabilities";
}

} // namespace App
