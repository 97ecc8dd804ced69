// Bloom: drawn with four samples a pixel, resolved, and a blurred copy of a quarter's size added.
#include "examples/ported/plaingl.h"
#include "examples/ported/ported.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

using namespace ORU::OGL;
using ported::kSide;
using ported::Picture;

namespace {

constexpr int kSmall = kSide / 4, kSamples = 4;

char const *const kLampVertexShader = R"(#version 330
    const vec2 corners[9] = vec2[9](vec2(-0.8, -0.7), vec2(-0.1, -0.5), vec2(-0.6, 0.1),
                                    vec2(0.2, -0.7), vec2(0.8, -0.5), vec2(0.7, 0.3),
                                    vec2(-0.4, 0.4), vec2(0.3, 0.2), vec2(0.1, 0.85));
    const vec3 lights[3] = vec3[3](vec3(4.0, 0.8, 0.3), vec3(0.4, 3.0, 1.0), vec3(0.6, 0.9, 5.0));
    flat out vec3 light;
    void main() {
        light = lights[gl_VertexID / 3];
        gl_Position = vec4(corners[gl_VertexID], 0.0, 1.0);
    })";

char const *const kLampShader = R"(#version 330
    flat in vec3 light;
    out vec4 colour;
    void main() { colour = vec4(light, 1.0); })";

// A triangle that covers everything.
char const *const kWholeVertexShader = R"(#version 330
    out vec2 place;
    void main() {
        place = vec2(gl_VertexID % 2, gl_VertexID / 2) * 2.0;
        gl_Position = vec4(place * 2.0 - 1.0, 0.0, 1.0);
    })";

// Nine texels in a row or a column, the nearer the heavier.
char const *const kBlurShader = R"(#version 330
    uniform sampler2D light;
    uniform vec2 step;
    in vec2 place;
    out vec4 colour;
    void main() {
        colour = vec4(0.0);
        for (int i = -4; i <= 4; ++i)
            colour += (5.0 - abs(float(i))) / 25.0 * texture(light, place + float(i) * step);
    })";

char const *const kSumShader = R"(#version 330
    uniform sampler2D light, glow;
    in vec2 place;
    out vec4 colour;
    void main() {
        vec3 sum = texture(light, place).rgb + texture(glow, place).rgb;
        colour = vec4(sum / (1.0 + sum), 1.0);
    })";

constexpr int kPlainMark = __LINE__;
struct PlainCanvas {
    GLuint texture = 0, framebuffer = 0;
};

PlainCanvas MakePlainCanvas(int side) {
    PlainCanvas canvas;
    glGenTextures(1, &canvas.texture);
    glBindTexture(GL_TEXTURE_2D, canvas.texture);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA16F, side, side, 0, GL_RGBA, GL_FLOAT, nullptr);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, GL_CLAMP_TO_EDGE);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_T, GL_CLAMP_TO_EDGE);
    glGenFramebuffers(1, &canvas.framebuffer);
    glBindFramebuffer(GL_FRAMEBUFFER, canvas.framebuffer);
    glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, canvas.texture, 0);
    plain::CheckFramebuffer("canvas");
    return canvas;
}

Picture DrawPlain(GLuint target) {
    PlainCanvas light = MakePlainCanvas(kSide);
    PlainCanvas small = MakePlainCanvas(kSmall);
    PlainCanvas other = MakePlainCanvas(kSmall);
    GLuint samples = 0, scene = 0, array = 0;
    glGenRenderbuffers(1, &samples);
    glBindRenderbuffer(GL_RENDERBUFFER, samples);
    glRenderbufferStorageMultisample(GL_RENDERBUFFER, kSamples, GL_RGBA16F, kSide, kSide);
    glGenFramebuffers(1, &scene);
    glBindFramebuffer(GL_FRAMEBUFFER, scene);
    glFramebufferRenderbuffer(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_RENDERBUFFER, samples);
    plain::CheckFramebuffer("scene");
    glGenVertexArrays(1, &array);
    glBindVertexArray(array);
    GLuint const lamps = plain::MakeProgram(kLampVertexShader, kLampShader);
    GLuint const blur = plain::MakeProgram(kWholeVertexShader, kBlurShader);
    GLuint const sum = plain::MakeProgram(kWholeVertexShader, kSumShader);

    glClearColor(0.02f, 0.02f, 0.05f, 1);
    glClear(GL_COLOR_BUFFER_BIT);
    glUseProgram(lamps);
    glDrawArrays(GL_TRIANGLES, 0, 9);
    glBindFramebuffer(GL_READ_FRAMEBUFFER, scene);
    glBindFramebuffer(GL_DRAW_FRAMEBUFFER, light.framebuffer);
    glBlitFramebuffer(0, 0, kSide, kSide, 0, 0, kSide, kSide, GL_COLOR_BUFFER_BIT, GL_NEAREST);
    glBindFramebuffer(GL_READ_FRAMEBUFFER, light.framebuffer);
    glBindFramebuffer(GL_DRAW_FRAMEBUFFER, small.framebuffer);
    glBlitFramebuffer(0, 0, kSide, kSide, 0, 0, kSmall, kSmall, GL_COLOR_BUFFER_BIT, GL_LINEAR);
    plain::Check("light");

    glUseProgram(blur);
    glViewport(0, 0, kSmall, kSmall);
    for (bool const across : {true, false}) {
        glBindFramebuffer(GL_FRAMEBUFFER, (across ? other : small).framebuffer);
        glBindTexture(GL_TEXTURE_2D, (across ? small : other).texture);
        glUniform2f(glGetUniformLocation(blur, "step"), across ? 1.f / kSmall : 0,
                    across ? 0 : 1.f / kSmall);
        glDrawArrays(GL_TRIANGLES, 0, 3);
    }
    plain::Check("blur");

    glBindFramebuffer(GL_FRAMEBUFFER, target);
    glViewport(0, 0, kSide, kSide);
    glUseProgram(sum);
    glActiveTexture(GL_TEXTURE1);
    glBindTexture(GL_TEXTURE_2D, small.texture);
    glActiveTexture(GL_TEXTURE0);
    glBindTexture(GL_TEXTURE_2D, light.texture);
    glUniform1i(glGetUniformLocation(sum, "light"), 0);
    glUniform1i(glGetUniformLocation(sum, "glow"), 1);
    glDrawArrays(GL_TRIANGLES, 0, 3);
    Picture picture = ported::ReadBack(target);
    plain::Check("sum");

    for (PlainCanvas const &canvas : {light, small, other}) {
        glDeleteFramebuffers(1, &canvas.framebuffer);
        glDeleteTextures(1, &canvas.texture);
    }
    glDeleteFramebuffers(1, &scene);
    glDeleteRenderbuffers(1, &samples);
    glDeleteVertexArrays(1, &array);
    glUseProgram(0);
    for (GLuint const program : {lamps, blur, sum})
        glDeleteProgram(program);
    return picture;
}

constexpr int kPortedMark = __LINE__;
struct Canvas {
    explicit Canvas(unsigned int side)
        : texture(Texture::INTERNALFORMAT_RGBA16F_ARB, side, side, false) {
        TextureUnit::Unit(0)->bind(&texture);
        texture.setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
        framebuffer.bind();
        framebuffer.attachTexture(texture, 0, Framebuffer::ATTACHMENT_COLOR0);
    }

    Texture2D texture;
    Framebuffer framebuffer;
};

Picture DrawPorted(Framebuffer &target) {
    Canvas light(kSide), small(kSmall), other(kSmall);
    Renderbuffer samples(GL_RGBA16F, kSide, kSide, kSamples);
    Framebuffer scene;
    scene.bind();
    scene.attach(&samples, 0);
    VertexArray const corners;
    Program lamps = ported::MakeProgram(kLampVertexShader, kLampShader);
    Program blur = ported::MakeProgram(kWholeVertexShader, kBlurShader);
    Program sum = ported::MakeProgram(kWholeVertexShader, kSumShader);

    float const night[] = {0.02f, 0.02f, 0.05f, 1};
    Framebuffer::ClearColor(&scene, 0, night, nullptr);
    {
        ProgramEnabledScope const enabled(&lamps);
        corners.drawArrays(GL_TRIANGLES, 0, 9);
    }
    ORU::IntegerRect const all({0, 0}, {kSide, kSide}), quarter({0, 0}, {kSmall, kSmall});
    Framebuffer::Resolve(&scene, &light.framebuffer, all.size());
    Framebuffer::Blit(&light.framebuffer, all, &small.framebuffer, quarter,
                      Framebuffer::CONTENTS_COLOR, Texture::FILTER_LINEAR);

    for (bool const across : {true, false}) {
        TemporaryViewportScope const part({0, 0, kSmall, kSmall});
        ProgramEnabledScope const enabled(&blur);
        (across ? other : small).framebuffer.bind();
        TextureUnit::Unit(0)->bind(&(across ? small : other).texture);
        blur.setUniform("step", across ? 1.f / kSmall : 0.f, across ? 0.f : 1.f / kSmall);
        corners.drawArrays(GL_TRIANGLES, 0, 3);
    }

    target.bind();
    ProgramEnabledScope const enabled(&sum);
    TextureState::SetActiveTextureUnit(1);
    TextureUnit::Unit(1)->bind(&small.texture);
    TextureState::SetActiveTextureUnit(0);
    TextureUnit::Unit(0)->bind(&light.texture);
    sum.setUniformSampler2D("light", 0);
    sum.setUniformSampler2D("glow", 1);
    corners.drawArrays(GL_TRIANGLES, 0, 3);
    return ported::ReadBack(target.objectID());
}

constexpr int kEndMark = __LINE__;

} // namespace

ported::Comparison const ported::kBloomWithResolve = {
    "bloom_with_resolve", DrawPlain, DrawPorted, {kPlainMark, kPortedMark, kEndMark}};
