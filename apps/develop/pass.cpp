// A fragment shader run over every pixel of a texture.
#include "apps/develop/pass.h"

#include "apps/common/failure.h"
#include "apps/develop/shaders.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/texture2.h"

namespace Develop {

using namespace ORU::OGL;

namespace {

constexpr unsigned int cVertices = 3;

/// One triangle that covers everything: no diagonal, along which pixels would be computed twice.
VertexBuffer MakeCover() {
    static constexpr float sCorners[cVertices][2] = {{-1, -1}, {3, -1}, {-1, 3}};
    VertexBuffer cover(
        {{"position", VertexBuffer::ATTRIBUTETYPE_FLOAT2, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}},
        cVertices, VertexBuffer::PRIMITIVETYPE_TRIANGLES);
    cover.setField("position", reinterpret_cast<unsigned char const *>(sCorners), false, 0, 0);
    return cover;
}

} // namespace

Pass::Pass(std::string const &fragmentShader) : cover_(MakeCover()) {
    std::string const language = ShadingLanguageLine();
    char const *const vertex[] = {language.c_str(), cCoverVertexShader};
    char const *const fragment[] = {language.c_str(), fragmentShader.c_str()};
    program_.loadVertexShader(2, vertex, nullptr);
    program_.loadFragmentShader(2, fragment, nullptr);
    program_.link(true);
    cover_.setupWithProgram(&program_);
    cover_.marshallData();
}

void Pass::draw(Texture2D &target) {
    framebuffer_.bind();
    framebuffer_.attach(&target, 0, 0);
    if (!framebuffer_.statusOkay(nullptr))
        throw App::Failure("this OpenGL cannot draw into such a picture");
    ORU_GL(Viewport, 0, 0, static_cast<GLsizei>(target.width(0)),
           static_cast<GLsizei>(target.height(0)));
    cover_.drawPrimitives();
    framebuffer_.detach(&target, 0);
    framebuffer_.unbind();
}

} // namespace Develop
