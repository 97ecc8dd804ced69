// Draws balls into textures that say what is seen in each pixel, then lights the pixels: the left
// third of the picture shows the colours, the middle one the normals, the right one both under
// three lamps.
#include "examples/opengl/example.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

using namespace ORU::OGL;

namespace {

constexpr int kWidth = 360, kHeight = 240;
constexpr unsigned int kColumns = 12, kRows = 8; ///< balls

constexpr char kVertex[] = R"(#version 150
    in vec4 ball; // middle in pixels, radius
    in vec3 paint;
    out vec4 theBall;
    out vec3 thePaint;
    void main() { theBall = ball; thePaint = paint; })";

// A point becomes the square around its ball.
constexpr char kGeometry[] = R"(#version 150
    layout(points) in;
    layout(triangle_strip, max_vertices = 4) out;
    uniform vec2 size;
    in vec4 theBall[];
    in vec3 thePaint[];
    flat out vec4 ball;
    flat out vec3 paint;
    void main() {
        for (int i = 0; i < 4; ++i) {
            vec2 corner = vec2(i % 2, i / 2) * 2.0 - 1.0;
            ball = theBall[0];
            paint = thePaint[0];
            gl_Position = vec4((ball.xy + ball.w * corner) / size * 2.0 - 1.0, 0.0, 1.0);
            EmitVertex();
        }
    })";

// Where the pixel's ray meets the ball, if it does.
constexpr char kFragment[] = R"(#version 150
    flat in vec4 ball;
    flat in vec3 paint;
    out vec4 place;
    out vec4 normal;
    out vec4 colour;
    void main() {
        vec2 aside = gl_FragCoord.xy - ball.xy;
        float rest = ball.w * ball.w - dot(aside, aside);
        if (rest < 0.0)
            discard;
        vec3 fromMiddle = vec3(aside, sqrt(rest));
        place = vec4(ball.xyz + fromMiddle, 1.0);
        normal = vec4(fromMiddle / ball.w, 1.0);
        colour = vec4(paint, 1.0);
        gl_FragDepth = 0.5 - place.z / 400.0;
    })";

constexpr char kWholeVertex[] = R"(#version 150
    in vec2 corner;
    void main() { gl_Position = vec4(corner, 0.0, 1.0); })";

constexpr char kLighting[] = R"(#version 150
    uniform sampler2D places, normals, colours;
    uniform int band;
    out vec4 result;
    const vec3 lamps[3] = vec3[3](vec3(260, 220, 60), vec3(340, 40, 50), vec3(230, 90, 90));
    const vec3 shades[3] = vec3[3](vec3(1, 0.9, 0.7), vec3(0.3, 0.5, 1), vec3(0.9, 0.3, 0.3));
    void main() {
        ivec2 pixel = ivec2(gl_FragCoord.xy);
        vec4 place = texelFetch(places, pixel, 0);
        vec3 normal = texelFetch(normals, pixel, 0).xyz, colour = texelFetch(colours, pixel, 0).rgb;
        vec3 light = vec3(0.05);
        for (int i = 0; i < 3; ++i) {
            vec3 way = lamps[i] - place.xyz;
            float square = dot(way, way);
            light += shades[i] * max(dot(normal, way) / sqrt(square), 0.0) / (0.3 + square / 9000.0);
        }
        if (place.w == 0.0)
            result = vec4(0.1, 0.1, 0.12, 1.0);
        else
            result = vec4(band == 0 ? colour : band == 1 ? 0.5 + 0.5 * normal : colour * light, 1.0);
    })";

VertexBuffer::Field Floats(char const *name, VertexBuffer::AttributeType type) {
    return {name, type, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW};
}

/// Rows of balls of three colours, some in front of others.
VertexBuffer Balls(Program &program) {
    std::vector<float> balls, paints;
    for (unsigned int i = 0; i < kColumns * kRows; ++i) {
        unsigned int const line = i / kColumns;
        auto const column = static_cast<float>(i % kColumns), row = static_cast<float>(line);
        balls.insert(balls.end(),
                     {30 * column + 15.3f, 30 * row + 15.2f, static_cast<float>(i * 7 % 10),
                      14.5f + static_cast<float>(i % 5)});
        for (unsigned int component = 0; component < 3; ++component)
            paints.push_back((i % kColumns + line) % 3 == component ? 1.f : 0.4f);
    }
    VertexBuffer points({Floats("ball", VertexBuffer::ATTRIBUTETYPE_FLOAT4),
                         Floats("paint", VertexBuffer::ATTRIBUTETYPE_FLOAT3)},
                        kColumns * kRows, VertexBuffer::PRIMITIVETYPE_POINTS);
    points.setField("ball", example::Bytes(balls), false, 0, 0);
    points.setField("paint", example::Bytes(paints), false, 0, 0);
    points.setupWithProgram(&program);
    points.marshallData();
    return points;
}

/// What is seen in each pixel.
struct Seen {
    Texture2D place{Texture::INTERNALFORMAT_RGBA32F_ARB, kWidth, kHeight, false};
    Texture2D normal{Texture::INTERNALFORMAT_RGBA32F_ARB, kWidth, kHeight, false};
    Texture2D colour{Texture::INTERNALFORMAT_RGBA32F_ARB, kWidth, kHeight, false};
};

void DrawBalls(Seen &seen) {
    Program program;
    program.loadVertexShader(kVertex);
    program.loadGeometryShader(kGeometry);
    program.loadFragmentShader(kFragment);
    program.setFragmentOutputLocation(0, "place");
    program.setFragmentOutputLocation(1, "normal");
    program.setFragmentOutputLocation(2, "colour");
    program.link(true);

    Renderbuffer depth(GL_DEPTH_COMPONENT24, kWidth, kHeight);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&seen.place, 0, 0);
    framebuffer.attach(&seen.normal, 0, 1);
    framebuffer.attach(&seen.colour, 0, 2);
    framebuffer.attach(&depth, 0);
    framebuffer.setDrawBuffers(
        {Framebuffer::Color(0), Framebuffer::Color(1), Framebuffer::Color(2)});

    TemporaryViewportScope const whole({0, 0, kWidth, kHeight});
    TemporaryDepthScope const nearest([](DepthState &state) { state.enabled = 1; });
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT | GL_DEPTH_BUFFER_BIT);
    ProgramEnabledScope const enabled(&program);
    program.setUniform("size", static_cast<float>(kWidth), static_cast<float>(kHeight));
    Balls(program).drawPrimitives();
    framebuffer.unbind();
}

void LightPixels(Seen &seen) {
    Program program;
    program.loadVertexShader(kWholeVertex);
    program.loadFragmentShader(kLighting);
    program.link(true);
    VertexBuffer triangle({Floats("corner", VertexBuffer::ATTRIBUTETYPE_FLOAT2)}, 3,
                          VertexBuffer::PRIMITIVETYPE_TRIANGLES);
    triangle.setField("corner", example::Bytes(std::vector<float>{-1, -1, 3, -1, -1, 3}), false, 0,
                      0);
    triangle.setupWithProgram(&program);
    triangle.marshallData();

    TemporaryViewportScope const whole({0, 0, kWidth, kHeight});
    ProgramEnabledScope const enabled(&program);
    Texture2D *const textures[] = {&seen.place, &seen.normal, &seen.colour};
    char const *const samplers[] = {"places", "normals", "colours"};
    for (int unit = 0; unit < 3; ++unit) {
        auto const index = static_cast<unsigned int>(unit);
        TextureState::SetActiveTextureUnit(index);
        TextureUnit::Unit(index)->bind(textures[unit]);
        program.setUniformSampler2D(samplers[unit], unit);
    }
    for (int band = 0; band < 3; ++band) {
        TemporaryScissorScope const third({1, band * kWidth / 3, 0, kWidth / 3, kHeight});
        program.setUniform("band", band);
        triangle.drawPrimitives();
    }
}

void Draw(std::filesystem::path const &file) {
    AutoInitializer const library;
    ContextOffscreen const context;
    context.makeCurrent();

    Seen seen;
    DrawBalls(seen);
    Texture2D picture(Texture::INTERNALFORMAT_RGBA8, kWidth, kHeight, false);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&picture, 0, 0);
    LightPixels(seen);
    example::SavePicture(file, kWidth, kHeight);
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, Draw);
}
