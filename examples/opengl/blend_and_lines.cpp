// Blend and line scopes: state changed for a stretch of drawing, and put back by itself.
#include "examples/opengl/example.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/blendscope.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/linescope.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <array>

using namespace ORU::OGL;

namespace {

int const kWidth = 240, kHeight = 160;

// Positions are in pixels, the origin is the lower left corner.
char const *const kVertexShader = "attribute vec2 place;"
                                  "uniform vec2 size;"
                                  "void main() {"
                                  "    gl_Position = vec4(2.0 * place / size - 1.0, 0.0, 1.0);"
                                  "}";

char const *const kFragmentShader = "uniform vec4 colour;"
                                    "void main() { gl_FragColor = colour; }";

/// Draws figures in one colour each.
class Pen {
public:
    Pen() {
        program_.loadVertexShader(1, &kVertexShader, nullptr);
        program_.loadFragmentShader(1, &kFragmentShader, nullptr);
        program_.link(true);
        program_.enable();
        program_.setUniform("size", float{kWidth}, float{kHeight});
        program_.disable();
        colour_ = program_.getUniformLocation("colour");
    }

    void rectangle(float left, float bottom, float right, float top) {
        std::array<float, 8> const corners = {left, bottom, right, bottom, left, top, right, top};
        draw(corners, VertexBuffer::PRIMITIVETYPE_TRIANGLE_STRIP);
    }

    void line(float x0, float y0, float x1, float y1) {
        std::array<float, 4> const ends = {x0, y0, x1, y1};
        draw(ends, VertexBuffer::PRIMITIVETYPE_LINES);
    }

    void setColour(float red, float green, float blue, float alpha) {
        rgba_ = {red, green, blue, alpha};
    }

private:
    template<std::size_t Count>
    void draw(std::array<float, Count> const &places, VertexBuffer::PrimitiveType type) {
        VertexBuffer figure({{"place", VertexBuffer::ATTRIBUTETYPE_FLOAT2,
                              VertexBuffer::EXPECTEDUSAGE_STREAM_DRAW}},
                            Count / 2, type);
        figure.setField("place", example::Bytes(places), false, 0, 0);
        figure.setupWithProgram(&program_);
        figure.marshallData();
        ProgramEnabledScope const scope(&program_);
        program_.setUniform_Unsafe(colour_, rgba_[0], rgba_[1], rgba_[2], rgba_[3]);
        figure.drawPrimitives();
    }

    Program program_;
    int colour_ = -1;
    std::array<float, 4> rgba_ = {1, 1, 1, 1};
};

void Draw(std::filesystem::path const &file) {
    AutoInitializer const library;
    ContextOffscreen const context;
    context.makeCurrent();
    Renderbuffer pixels(GL_RGBA8, kWidth, kHeight);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&pixels, 0);
    ORU_GL(Viewport, 0, 0, kWidth, kHeight);
    ORU_GL(ClearColor, 1.f, 1.f, 1.f, 1.f);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT);

    Pen pen;
    {
        TemporaryAlphaBlendScope const blend; // filters of glass, half transparent
        pen.setColour(1, 0, 0, 0.5f);
        pen.rectangle(20, 60, 120, 140);
        pen.setColour(0, 0, 1, 0.5f);
        pen.rectangle(80, 40, 200, 120);
    }
    pen.setColour(0, 0.5f, 0, 0.5f); // opaque: the scope is over
    pen.rectangle(180, 100, 220, 140);

    pen.setColour(0, 0, 0, 1);
    pen.line(20, 30.5f, 220, 30.5f);
    {
        TemporaryLineWidthScope const wide(5);
        pen.line(20, 20.5f, 220, 20.5f);
        TemporaryLineStippleScope const dashes(1, 4, 0x0F0F);
        pen.line(20, 10.5f, 220, 10.5f);
    }
    pen.line(20, 150.5f, 220, 150.5f); // thin and solid again
    example::SavePicture(file, kWidth, kHeight);
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, Draw);
}
