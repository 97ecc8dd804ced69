// A decorator that writes a line of text for each OpenGL call.
#pragma once

#include "oru/oru_ogl/extensionator/openglinterceptordecorator.h"

#include <iostream>

namespace ORU::OGL {

/// Writes each OpenGL call with its arguments and the source position of the caller, then forwards
/// it.
///
/// ```cpp
/// std::ofstream file("gl.txt");
/// InterceptorScope<OpenGLTracer> const tracer(file);
/// ```
///
/// writes, until the scope ends, lines such as `app.cpp:86: glTexParameteri(GL_TEXTURE_2D,
/// GL_TEXTURE_MIN_FILTER, 9729)`. The form of an argument follows its type in the OpenGL prototype:
/// - GLenum: the constant's name (see ORUOGLTokenName); GLboolean: GL_TRUE or GL_FALSE;
/// - integers and bit masks in the stream's integer format, a GLhandleARB after "(GLhandleARB)";
///   GLbyte and GLubyte as one character;
/// - GLdouble as the stream writes it; GLfloat as its bit pattern with the value in a comment:
///   `makeFloat(1065353216) /* 1 */`;
/// - a text that names something (`char const *`) as it is; other pointers and GLsync as addresses.
///
/// The stream's formatting flags apply, and each line is composed in full and written at once.
/// There is no lock: lines of several threads may mix. A call that throws has been written before.
class ORU_API OpenGLTracer : public OpenGLInterceptorDecorator {
public:
    /// Makes a tracer that is in no chain yet.
    /// @param os   must live as long as the tracer is in the chain
    /// @param next the next link; pushing the tracer sets it anew
    explicit OpenGLTracer(std::ostream &os = std::cout, OpenGLInterceptor *next = nullptr);
    ~OpenGLTracer() override;

    /// @name The stream
    /// Where lines go; never null, not owned.
    /// @{
    std::ostream *outputStream() { return stream_; }
    std::ostream const *outputStream() const { return stream_; }
    /// @}
    /// Replaces the stream from the next call on.
    void setOutputStream(std::ostream &os) { stream_ = &os; }

#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments) Result cgm##Name Parameters override;
#include "oru/oru_ogl/extensionator/gloperations.inc"

private:
    std::ostream *stream_;
};

} // namespace ORU::OGL
