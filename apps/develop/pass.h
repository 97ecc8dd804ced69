// A fragment shader run over every pixel of a texture.
#pragma once

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <string>

namespace ORU {
namespace OGL {
class Texture2D;
} // namespace OGL
} // namespace ORU

namespace Develop {

/// Compiles once; then, for each target: enable `program()`, set its uniforms, bind the textures
/// that it reads, and draw.
class Pass {
public:
    /// @throws ORU::InternalException with the log when the shader does not compile
    explicit Pass(std::string const &fragmentShader);

    ORU::OGL::Program &program() { return program_; }

    /// Computes every pixel of a texture, which must not be bound.
    void draw(ORU::OGL::Texture2D &target);

private:
    ORU::OGL::Program program_;
    ORU::OGL::VertexBuffer cover_;
    ORU::OGL::Framebuffer framebuffer_;
};

} // namespace Develop
