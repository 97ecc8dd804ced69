// A link that a host puts in front of the OpenGL error checker.
#pragma once

#include "oru/oru_ogl/extensionator/openglinterceptor.h"

namespace ORU::OGL {

/// Base of decorators: knows the next link. A concrete decorator implements every operation and
/// forwards it to `interceptor()`; derive from OpenGLForwarder to write only those of interest.
class ORU_API OpenGLInterceptorDecorator : public OpenGLInterceptor {
public:
    /// Makes a link that is in no chain yet.
    /// @param next the next link, not owned; pushing the decorator sets it anew
    explicit OpenGLInterceptorDecorator(OpenGLInterceptor *next = nullptr) : next_(next) {}
    ~OpenGLInterceptorDecorator() override;

    /// The next link, null while the decorator is in no chain.
    OpenGLInterceptor *interceptor() { return next_; }
    OpenGLInterceptor const *interceptor() const { return next_; } ///< The next link.
    /// Called as the decorator is pushed.
    void setInterceptor(OpenGLInterceptor *next) { next_ = next; }

private:
    OpenGLInterceptor *next_;
};

} // namespace ORU::OGL
