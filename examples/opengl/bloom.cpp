// Bloom: lamps drawn with four samples a pixel, resolved, and their glow blurred and added.
#include "examples/opengl/example.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture2dmultisample.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

using namespace ORU::OGL;

namespace {

unsigned int const kWidth = 320, kHeight = 200;
ORU::IntegerRect const kWhole({0, 0}, ORU::size2(kWidth, kHeight));
ORU::IntegerRect const kQuarter({0, 0}, ORU::size2(kWidth / 4, kHeight / 4));

// Of light that goes far beyond white: 11 or 10 bits of floating point a channel.
auto const kLight = Texture::INTERNALFORMAT_R11F_G11F_B10F;

char const *const kVertexShader = "attribute vec2 corner;"
                                  "varying vec2 place;"
                                  "void main() {"
                                  "    place = 0.5 * corner + 0.5;"
                                  "    gl_Position = vec4(corner, 0.0, 1.0);"
                                  "}";

char const *const kLampShader = "uniform vec3 colour;"
                                "void main() { gl_FragColor = vec4(colour, 1.0); }";

// Nine texels in a row or a column, the nearer the heavier.
char const *const kBlurShader = "uniform sampler2D light;"
                                "uniform vec2 step;"
                                "varying vec2 place;"
                                "void main() {"
                                "    vec3 sum = vec3(0.0);"
                                "    for (int i = -4; i <= 4; ++i) {"
                                "        float weight = (5.0 - abs(float(i))) / 25.0;"
                                "        vec2 from = place + float(i) * step;"
                                "        sum += weight * texture2D(light, from).rgb;"
                                "    }"
                                "    gl_FragColor = vec4(sum, 1.0);"
                                "}";

char const *const kSumShader = "uniform sampler2D light;"
                               "uniform sampler2D glow;"
                               "varying vec2 place;"
                               "void main() {"
                               "    vec3 sum = texture2D(light, place).rgb"
                               "               + texture2D(glow, place).rgb;"
                               "    gl_FragColor = vec4(sum / (1.0 + sum), 1.0);"
                               "}";

/// Three triangles, and a rectangle that covers everything.
float const kLamps[3][6] = {{-0.8f, -0.7f, -0.3f, -0.5f, -0.6f, 0.1f},
                            {-0.1f, 0.1f, 0.3f, 0.2f, 0.05f, 0.7f},
                            {0.5f, -0.6f, 0.85f, -0.35f, 0.6f, 0.2f}};
float const kColours[3][3] = {{6, 1, 0.3f}, {0.5f, 5, 1.5f}, {0.8f, 1.2f, 8}};
float const kCorners[] = {-1, -1, 1, -1, -1, 1, 1, 1};

/// A program that draws corners.
class Pass {
public:
    explicit Pass(char const *fragmentShader) {
        program.loadVertexShader(1, &kVertexShader, nullptr);
        program.loadFragmentShader(1, &fragmentShader, nullptr);
        program.link(true);
    }

    /// Draws the whole viewport.
    void draw() { draw(kCorners, 4); }

    void draw(float const *corners, unsigned int count) {
        VertexBuffer figure({{"corner", VertexBuffer::ATTRIBUTETYPE_FLOAT2,
                              VertexBuffer::EXPECTEDUSAGE_STREAM_DRAW}},
                            count, VertexBuffer::PRIMITIVETYPE_TRIANGLE_STRIP);
        figure.setField("corner", reinterpret_cast<unsigned char const *>(corners), false, 0, 0);
        figure.setupWithProgram(&program);
        figure.marshallData();
        ProgramEnabledScope const scope(&program);
        figure.drawPrimitives();
    }

    Program program;
};

/// A texture with a framebuffer that draws into it.
struct Canvas {
    explicit Canvas(ORU::IntegerRect const &size, Texture::InternalFormat format = kLight)
        : texture(format, size.width(), size.height(), false) {
        framebuffer.bind();
        framebuffer.attachTexture(texture, 0, Framebuffer::ATTACHMENT_COLOR0);
    }

    void bind() {
        framebuffer.bind();
        ORU_GL(Viewport, 0, 0, static_cast<GLsizei>(texture.width(0)),
               static_cast<GLsizei>(texture.height(0)));
    }

    Texture2D texture;
    Framebuffer framebuffer;
};

void Shine(std::filesystem::path const &file) {
    AutoInitializer const library;
    ContextOffscreen const context;
    context.makeCurrent();
    Canvas light(kWhole), small(kQuarter), other(kQuarter),
        picture(kWhole, Texture::INTERNALFORMAT_RGBA8);

    // The lamps, with smooth edges.
    Texture2DMultisample const samples(kLight, kWidth, kHeight, 4);
    Framebuffer scene;
    scene.bind();
    scene.attachTexture(samples, 0, Framebuffer::ATTACHMENT_COLOR0);
    ORU_GL(Viewport, 0, 0, static_cast<GLsizei>(kWidth), static_cast<GLsizei>(kHeight));
    float const night[] = {0.02f, 0.02f, 0.05f, 1};
    Framebuffer::ClearColor(&scene, 0, night, nullptr);
    Pass lamp(kLampShader);
    for (std::size_t i = 0; i < 3; ++i) {
        {
            ProgramEnabledScope const scope(&lamp.program);
            lamp.program.setUniform("colour", kColours[i][0], kColours[i][1], kColours[i][2]);
        }
        lamp.draw(kLamps[i], 3);
    }
    Framebuffer::Resolve(&scene, &light.framebuffer, kWhole.size());

    // A quarter of each side is enough for a glow, and takes a sixteenth of the time.
    Framebuffer::Blit(&light.framebuffer, kWhole, &small.framebuffer, kQuarter,
                      Framebuffer::CONTENTS_COLOR, Texture::FILTER_LINEAR);
    Sampler const smooth(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR,
                         Texture::WRAPMODE_CLAMP_TO_EDGE);
    smooth.bind(0);
    smooth.bind(1);
    Pass blur(kBlurShader);
    for (bool const across : {true, false}) {
        Canvas &from = across ? small : other, &to = across ? other : small;
        TextureUnit::Unit(0)->bind(&from.texture);
        to.bind();
        {
            ProgramEnabledScope const scope(&blur.program);
            blur.program.setUniform("step", across ? 4.f / kWidth : 0.f,
                                    across ? 0.f : 4.f / kHeight);
        }
        blur.draw();
    }

    Pass sum(kSumShader);
    TextureUnit::Unit(0)->bind(&light.texture);
    TextureState::SetActiveTextureUnit(1);
    TextureUnit::Unit(1)->bind(&small.texture);
    TextureState::SetActiveTextureUnit(0);
    picture.bind();
    {
        ProgramEnabledScope const scope(&sum.program);
        sum.program.setUniform("light", 0);
        sum.program.setUniform("glow", 1);
    }
    sum.draw();
    example::SavePicture(file, kWidth, kHeight);
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, Shine);
}
