// Hello, offscreen: a triangle from a VertexBuffer, drawn without a window and saved as PNG.
#include "examples/opengl/example.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

using namespace ORU::OGL;

namespace {

char const *const kVertexShader = "attribute vec2 position;"
                                  "attribute vec3 colour;"
                                  "varying vec3 shade;"
                                  "void main() {"
                                  "    shade = colour;"
                                  "    gl_Position = vec4(position, 0.0, 1.0);"
                                  "}";

char const *const kFragmentShader = "varying vec3 shade;"
                                    "void main() { gl_FragColor = vec4(shade, 1.0); }";

float const kPositions[] = {-0.75f, -0.75f, 0.75f, -0.75f, 0.05f, 0.75f};
float const kColours[] = {1, 0, 0, 0, 1, 0, 0, 0, 1};

void Hello(std::filesystem::path const &file) {
    // The layer is open while this lives; a context on a hidden window makes OpenGL available.
    AutoInitializer const library;
    ContextOffscreen const context;
    context.makeCurrent();

    // Draw into a texture instead of a window.
    Texture2D picture(Texture::INTERNALFORMAT_RGBA8, 320, 240, false);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&picture, 0, 0);
    ORU_GL(Viewport, 0, 0, 320, 240);
    ORU_GL(ClearColor, 0.125f, 0.125f, 0.125f, 1.f);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT);

    Program program;
    program.loadVertexShader(1, &kVertexShader, nullptr);
    program.loadFragmentShader(1, &kFragmentShader, nullptr);
    program.link(true); // a mistake in a shader is an exception with the compiler's log

    VertexBuffer triangle(
        {{"position", VertexBuffer::ATTRIBUTETYPE_FLOAT2, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW},
         {"colour", VertexBuffer::ATTRIBUTETYPE_FLOAT3, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}},
        3, VertexBuffer::PRIMITIVETYPE_TRIANGLES);
    triangle.setField("position", example::Bytes(kPositions), false, 0, 0);
    triangle.setField("colour", example::Bytes(kColours), false, 0, 0);
    triangle.setupWithProgram(&program);
    triangle.marshallData();

    ProgramEnabledScope const scope(&program);
    triangle.drawPrimitives();
    example::SavePicture(file, 320, 240);
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, Hello);
}
