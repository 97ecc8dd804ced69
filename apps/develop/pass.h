// A fragment shader run over the pixels of a texture.
#pragma once

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <cstddef>
#include <string>

namespace ORU::OGL {
class Texture2D;
} // namespace ORU::OGL

namespace Develop {

/// A program and the framebuffer through which it draws into textures.
class Pass {
public:
    /// @throws ORU::InternalException with the log when a shader does not compile
    Pass(std::string const &vertexShader, std::string const &fragmentShader);

    /// To be enabled, and its uniforms set, before drawing.
    ORU::OGL::Program &program() { return program_; }

    /// Draws vertices, set up with the program, into the beginning of a texture, which must not be
    /// bound.
    /// @param width, height of what is drawn into
    /// @param cleared whether the texture is to be zero before
    /// @throws Failure when this OpenGL cannot draw into such a texture
    void draw(ORU::OGL::Texture2D &target, std::size_t width, std::size_t height,
              ORU::OGL::VertexBuffer &vertices, bool cleared);

private:
    ORU::OGL::Program program_;
    ORU::OGL::Framebuffer framebuffer_;
};

/// A pass over a rectangle of pixels.
class CoverPass : public Pass {
public:
    explicit CoverPass(std::string const &fragmentShader);

    /// Computes the pixels at the beginning of a texture, which must not be bound.
    void draw(ORU::OGL::Texture2D &target, std::size_t width, std::size_t height) {
        Pass::draw(target, width, height, cover_, false);
    }

private:
    ORU::OGL::VertexBuffer cover_;
};

} // namespace Develop
