// Programs of GLSL as the context knows it, and drawing them into a row of floats.
#pragma once

#include "tests/support/objecttest.h"

#include "oru/oru_ogl/extensionator/internal/functioncast.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/shader.h"

#include <utility>
#include <vector>

namespace oru_test {

/// A linked program, its sources past what makes GLSL 1.x fit for core contexts.
inline ORU::OGL::Program
Linked(std::vector<std::pair<ORU::OGL::Shader::ShaderType, std::string>> const &sources) {
    using namespace ORU::OGL;
    auto const setSource =
        internal::FunctionCast<PFNGLSHADERSOURCEPROC>(::wglGetProcAddress("glShaderSource"));
    Program program;
    for (auto const &[type, text] : sources) {
        Shader shader(type);
        char const *const source = text.c_str();
        setSource(shader.shaderID(), 1, &source, nullptr);
        shader.compile(true);
        program.attach(&shader);
    }
    program.link(true);
    return program;
}

/// Draws into a row of pixels, each four floats that are -1 where nothing is drawn.
template<class Draw>
std::vector<float> DrawnInto(int width, Draw draw) {
    ORU::OGL::Renderbuffer row(GL_RGBA32F, width, 1);
    ORU::OGL::Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&row, 0);
    ORU_GL(Viewport, 0, 0, width, 1);
    ORU_GL(ClearColor, -1.f, -1.f, -1.f, -1.f);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    draw();
    std::vector<float> pixels(std::size_t{4} * static_cast<std::size_t>(width));
    ORU_GL(ReadPixels, 0, 0, width, 1, GL_RGBA, GL_FLOAT, pixels.data());
    return pixels;
}

} // namespace oru_test
