// A fragment shader run over the pixels of a texture.
#include "apps/develop/pass.h"

#include "apps/common/failure.h"
#include "apps/develop/shaders.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/platformgl.h"

namespace Develop {

using namespace ORU::OGL;

namespace {

/// One triangle that covers everything.
VertexBuffer MakeCover() {
    static constexpr float kCorners[3][2] = {{-1, -1}, {3, -1}, {-1, 3}};
    VertexBuffer cover(
        {{"position", VertexBuffer::ATTRIBUTETYPE_FLOAT2, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}},
        3, VertexBuffer::PRIMITIVETYPE_TRIANGLES);
    cover.setField("position", reinterpret_cast<unsigned char const *>(kCorners), false, 0, 0);
    return cover;
}

} // namespace

Pass::Pass(std::string const &vertexShader, std::string const &fragmentShader) {
    std::string const language = ShadingLanguageLine();
    char const *const vertex[] = {language.c_str(), vertexShader.c_str()};
    char const *const fragment[] = {language.c_str(), fragmentShader.c_str()};
    program_.loadVertexShader(2, vertex, nullptr);
    program_.loadFragmentShader(2, fragment, nullptr);
    program_.link(true);
}

void Pass::draw(Texture2D &target, std::size_t width, std::size_t height, VertexBuffer &vertices,
                bool cleared) {
    framebuffer_.bind();
    framebuffer_.attach(&target, 0, 0);
    if (!framebuffer_.statusOkay(nullptr))
        throw App::Failure("this OpenGL cannot draw into such a picture");
    ORU_GL(Viewport, 0, 0, static_cast<GLsizei>(width), static_cast<GLsizei>(height));
    if (cleared)
        ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    vertices.drawPrimitives();
    framebuffer_.detach(&target, 0);
    framebuffer_.unbind();
}

CoverPass::CoverPass(std::string const &fragmentShader)
    : Pass(kCoverVertexShader, fragmentShader), cover_(MakeCover()) {
    cover_.setupWithProgram(&program());
    cover_.marshallData();
}

} // namespace Develop
