// The code of the chapter on drawing.
#include "oru/core/exceptions/calledfrom.h"
#include "oru/core/exceptions/logicalexception.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/blendscope.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/linescope.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/shader.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture2dmultisample.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <array>
#include <string>
#include <vector>

using namespace ORU::OGL;

namespace {

// [shaders]
char const *const kVertexShader = R"(
    attribute vec2 position;
    attribute float strength;
    varying float shade;
    void main() {
        shade = strength;
        gl_Position = vec4(position, 0.0, 1.0);
    })";

char const *const kFragmentShader = R"(
    uniform vec4 colour;
    uniform float gains[2];
    varying float shade;
    void main() { gl_FragColor = colour * shade * gains[0] + gains[1]; })";
// [shaders]

// [vertex]
struct Vertex {
    float x, y;
    float strength;
};
// [vertex]

class DrawingGuide : public ::testing::Test {
protected:
    void SetUp() override { context_.makeCurrent(); }

    static void build(Program &program) {
        program.loadVertexShader(1, &kVertexShader, nullptr);
        program.loadFragmentShader(1, &kFragmentShader, nullptr);
        program.link(true);
    }

    /// A square over everything, of one strength.
    static VertexBuffer square(Program &program, float strength) {
        Vertex const corners[] = {
            {-1, -1, strength}, {1, -1, strength}, {-1, 1, strength}, {1, 1, strength}};
        return buffer(program, corners);
    }

    static VertexBuffer buffer(Program &program, Vertex const (&corners)[4]) {
        // [layout]
        VertexBuffer square({{"position", VertexBuffer::ATTRIBUTETYPE_FLOAT2,
                              VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW},
                             {"strength", VertexBuffer::ATTRIBUTETYPE_FLOAT,
                              VertexBuffer::EXPECTEDUSAGE_DYNAMIC_DRAW}},
                            4, VertexBuffer::PRIMITIVETYPE_TRIANGLE_STRIP);

        // Each field is gathered from the array of vertices: its first value, and the way to the
        // next.
        auto const *bytes = reinterpret_cast<unsigned char const *>(corners);
        square.setField("position", bytes, false, sizeof(Vertex), 0);
        square.setField("strength", bytes + offsetof(Vertex, strength), false, sizeof(Vertex), 0);

        square.setupWithProgram(&program); // makes the OpenGL objects, finds the attributes
        square.marshallData();             // sends the vertices
        // [layout]
        return square;
    }

    static std::array<float, 4> pixel(int x, int y) {
        std::array<float, 4> rgba = {};
        ORU_GL(ReadPixels, x, y, 1, 1, GL_RGBA, GL_FLOAT, rgba.data());
        return rgba;
    }

private:
    AutoInitializer library_;
    ContextOffscreen context_;
};

using Colour = std::array<float, 4>;

} // namespace

TEST_F(DrawingGuide, DrawsASquare) {
    // [target]
    Texture2D picture(Texture::INTERNALFORMAT_RGBA32F_ARB, 64, 64, false);
    Renderbuffer depth(GL_DEPTH_COMPONENT24, 64, 64);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&picture, 0, 0); // mip level 0, colour attachment 0
    framebuffer.attach(&depth, 0);      // goes where its format belongs

    unsigned int status = 0;
    if (!framebuffer.statusOkay(&status))
        FAIL() << "the driver cannot draw into these together: " << ORUOGLTokenName(status);
    // [target]
    ORU_GL(Viewport, 0, 0, 64, 64);

    // [program]
    Program program;
    program.loadVertexShader(1, &kVertexShader, nullptr);
    program.loadFragmentShader(1, &kFragmentShader, nullptr);
    program.link(true);
    // [program]
    VertexBuffer square = DrawingGuide::square(program, 0.5f);

    // [draw]
    float const gains[] = {2, 0.25f};
    {
        ProgramEnabledScope const scope(&program);
        program.setUniform("colour", 0.25f, 0.5f, 1.f, 1.f);
        program.setUniform("gains", 2, gains);
        square.drawPrimitives();
    } // now no program is current
    // [draw]
    EXPECT_EQ((Colour{0.5f, 0.75f, 1.25f, 1.25f}), pixel(63, 63));

    // [often]
    int const colour = program.getUniformLocation("colour"); // once
    ProgramEnabledScope const scope(&program);
    for (float const red : {0.f, 0.25f, 0.5f}) {
        program.setUniform_Unsafe(colour, red, 0.f, 0.f, 1.f); // one OpenGL call
        square.drawPrimitives();
    }
    // [often]
    EXPECT_EQ((Colour{0.75f, 0.25f, 0.25f, 1.25f}), pixel(0, 0));

    // [unbind]
    framebuffer.detach(&picture, 0);
    framebuffer.unbind();
    // [unbind]
}

TEST_F(DrawingGuide, ResolvesSamples) {
    // [resolve]
    Texture2DMultisample const samples(Texture::INTERNALFORMAT_RGBA8, 64, 64, 4);
    Texture2D smooth(Texture::INTERNALFORMAT_RGBA8, 64, 64, false);
    Framebuffer scene, resolved;
    resolved.bind();
    resolved.attachTexture(smooth, 0, Framebuffer::ATTACHMENT_COLOR0);
    scene.bind();
    scene.attachTexture(samples, 0, Framebuffer::ATTACHMENT_COLOR0);
    std::string const problem = scene.incompleteness(); // empty: it can be drawn into

    float const red[] = {1, 0, 0, 1};
    Framebuffer::ClearColor(&scene, 0, red, nullptr); // all of it; or a rectangle
    Framebuffer::Resolve(&scene, &resolved, ORU::size2(64, 64));
    std::array<unsigned char, 4> texel = {};
    Framebuffer::Read(&resolved, ORU::IntegerRect({5, 7}, 1), Texture::FORMAT_RGBA,
                      Texture::TYPE_UNSIGNED_BYTE, texel.data(), 1);
    // [resolve]
    EXPECT_EQ("", problem);
    EXPECT_EQ((std::array<unsigned char, 4>{255, 0, 0, 255}), texel);
    Framebuffer::BindDefault();
}

TEST_F(DrawingGuide, ChangesOneField) {
    Renderbuffer picture(GL_RGBA32F, 8, 8);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&picture, 0);
    ORU_GL(Viewport, 0, 0, 8, 8);
    Program program;
    build(program);
    VertexBuffer square = DrawingGuide::square(program, 1);
    ProgramEnabledScope const scope(&program);
    program.setUniform("colour", 1.f, 1.f, 1.f, 1.f);
    float const gains[] = {1, 0};
    program.setUniform("gains", 2, gains);

    // [change]
    std::vector<float> const dimmed(4, 0.125f);
    square.setField("strength", reinterpret_cast<unsigned char const *>(dimmed.data()), false, 0,
                    0);
    square.marshallData();
    square.drawPrimitives();
    // [change]
    EXPECT_EQ((Colour{0.125f, 0.125f, 0.125f, 0.125f}), pixel(4, 4));

    // [copy]
    VertexBuffer copy = square; // the vertices, but no OpenGL objects
    copy.setupWithProgram(&program);
    copy.marshallData();
    // [copy]
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    copy.drawPrimitives();
    EXPECT_EQ((Colour{0.125f, 0.125f, 0.125f, 0.125f}), pixel(4, 4));
}

TEST_F(DrawingGuide, ReportsMistakes) {
    std::string told;
    // [mistake]
    FragmentShader shader;
    shader.load("void main() { gl_FragColor = vec3(1.0); }");
    try {
        shader.compile(true);
    } catch (ORU::LogicalException const &e) {
        told = e.message(); // "Program Compile Error: ", a line feed, and what the compiler says
    }
    // [mistake]
    EXPECT_EQ(0u, told.find("Program Compile Error: \n"));
    EXPECT_NE(std::string::npos, told.find("vec4")) << told;

    // [quiet]
    shader.compile(false);
    if (!shader.isCompiled()) {
        std::string log(static_cast<std::size_t>(shader.getInfoLogLength()), '\0');
        shader.getInfoLog(static_cast<int>(log.size()), log.data());
        told = log;
    }
    // [quiet]
    EXPECT_NE(std::string::npos, told.find("vec4")) << told;

    Program program;
    program.attach(&shader);
    try {
        // [from_here]
        ORU_FROM_HERE(program.link(true)); // a failure's notes end with ", called from" this line
        // [from_here]
    } catch (ORU::LogicalException const &e) {
        told = e.note();
    }
    EXPECT_NE(std::string::npos, told.find(", called from docs/snippets/drawing.cpp:")) << told;
}

TEST_F(DrawingGuide, ScopesPutStateBack) {
    Renderbuffer picture(GL_RGBA8, 8, 8);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&picture, 0);
    auto const drawLabels = [] { EXPECT_TRUE(::glIsEnabled(GL_BLEND)); };
    auto const drawSelection = [] {
        GLfloat width = 0;
        ::glGetFloatv(GL_LINE_WIDTH, &width);
        EXPECT_EQ(2, width);
        EXPECT_TRUE(::glIsEnabled(GL_LINE_STIPPLE));
    };
    // [scopes]
    {
        TemporaryAlphaBlendScope const blend;
        drawLabels();
    } // blending is as it was, factors and equations too
    {
        TemporaryLineWidthScope const width(2);
        TemporaryLineStippleScope const dashes(1, 4, 0x0F0F); // 16 pixels on, 16 off
        drawSelection();
    }
    // [scopes]
    EXPECT_FALSE(::glIsEnabled(GL_BLEND));
    EXPECT_FALSE(::glIsEnabled(GL_LINE_STIPPLE));
}

TEST_F(DrawingGuide, NamesComeAndGo) {
    unsigned int name = 0;
    ORU_GL(GenTextures, 1, &name);
    ORU_GL(BindTexture, GL_TEXTURE_2D, name);
    ORU_GL(TexImage2D, GL_TEXTURE_2D, 0, GL_RGBA8, 8, 4, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
    unsigned int storage = 0;
    ORU_GL(GenRenderbuffersEXT, 1, &storage);
    ORU_GL(BindRenderbufferEXT, GL_RENDERBUFFER_EXT, storage);
    ORU_GL(RenderbufferStorageEXT, GL_RENDERBUFFER_EXT, GL_DEPTH_COMPONENT24, 8, 4);
    Program shading;
    {
        // [names]
        Texture2D const camera(name, borrow_name_tag());    // the name stays its owner's
        Renderbuffer const depth(storage, take_name_tag()); // deleted with the object
        unsigned int const program = shading.disown();      // the caller's to delete now
        // [names]
        EXPECT_EQ(8u, camera.width(0));
        EXPECT_EQ(4, depth.height());
        ORU_GL(DeleteProgram, program);
    }
    EXPECT_TRUE(ORU_GL(IsTexture, name));
    EXPECT_FALSE(ORU_GL(IsRenderbufferEXT, storage));
    ORU_GL(DeleteTextures, 1, &name);
}
