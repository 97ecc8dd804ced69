// The OpenGL that a program works with, without a window.
#pragma once

#include "apps/common/image.h"
#include "apps/common/tracefile.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"

#include <memory>
#include <string>

namespace ORU::OGL {
class OpenGLTracer;
template<class Decorator>
class InterceptorScope;
} // namespace ORU::OGL

namespace App {

/// An open OpenGL layer with an offscreen context on the primary display, current on the thread
/// that made it.
class OffscreenGpu {
public:
    /// @param traceFile where every OpenGL call is written, or empty
    /// @throws Failure when the file cannot be written or the context lacks OpenGL 3.0
    /// @throws ORU::LogicalException when there is no context to be had
    explicit OffscreenGpu(std::string const &traceFile);
    ~OffscreenGpu();
    OffscreenGpu(OffscreenGpu const &) = delete;
    OffscreenGpu &operator=(OffscreenGpu const &) = delete;

    ORU::OGL::ContextOffscreen const &context() const { return *context_; }

    /// What textures and viewports take.
    SizeLimit sizeLimit() const;

    /// Adapter, OpenGL version, renderer and number of capabilities, for people.
    std::string description() const;

private:
    ORU::OGL::AutoInitializer library_;
    std::unique_ptr<TraceFile> traceFile_;
    std::unique_ptr<ORU::OGL::InterceptorScope<ORU::OGL::OpenGLTracer>> tracer_;
    std::unique_ptr<ORU::OGL::ContextOffscreen> context_;
};

} // namespace App
