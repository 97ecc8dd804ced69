// A deferred shader: one pass writes colour, normal and place of what is seen, another lights them.
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

constexpr int kBalls = 24;

// The square around a ball, by the numbers of instance and corner.
char const *const kBallVertexShader = R"(#version 330
    out vec2 aside;
    flat out vec4 ball;
    flat out vec3 paint;
    void main() {
        float i = float(gl_InstanceID), angle = 2.4 * i;
        ball = vec4(0.15 * sqrt(i) * vec2(cos(angle), sin(angle)), 0.3 * sin(3.0 * i), 0.22);
        paint = 0.6 + 0.4 * cos(angle + vec3(0.0, 2.1, 4.2));
        aside = vec2(gl_VertexID % 2, gl_VertexID / 2) * 2.0 - 1.0;
        gl_Position = vec4(ball.xy + ball.w * aside, 0.0, 1.0);
    })";

char const *const kBallShader = R"(#version 330
    in vec2 aside;
    flat in vec4 ball;
    flat in vec3 paint;
    layout(location = 0) out vec4 colour;
    layout(location = 1) out vec4 normal;
    layout(location = 2) out vec4 place;
    void main() {
        float rest = 1.0 - dot(aside, aside);
        if (rest < 0.0)
            discard;
        normal = vec4(aside, sqrt(rest), 0.0);
        place = vec4(ball.xyz + ball.w * normal.xyz, 1.0);
        colour = vec4(paint, 1.0);
        gl_FragDepth = 0.5 - 0.5 * place.z;
    })";

// A triangle that covers everything.
char const *const kWholeVertexShader = R"(#version 330
    void main() { gl_Position = vec4(vec2(gl_VertexID % 2, gl_VertexID / 2) * 4.0 - 1.0, 0.0, 1.0); })";

char const *const kLightShader = R"(#version 330
    uniform sampler2D colours, normals, places;
    out vec4 result;
    const vec3 lamps[3] = vec3[3](vec3(-0.8, 0.6, 0.8), vec3(0.9, 0.2, 0.5), vec3(0.0, -0.9, 0.6));
    const vec3 shades[3] = vec3[3](vec3(1.0, 0.8, 0.5), vec3(0.4, 0.6, 1.0), vec3(0.9, 0.3, 0.4));
    void main() {
        ivec2 pixel = ivec2(gl_FragCoord.xy);
        vec4 place = texelFetch(places, pixel, 0);
        vec3 normal = texelFetch(normals, pixel, 0).xyz, light = vec3(0.15);
        for (int i = 0; i < 3; ++i) {
            vec3 way = lamps[i] - place.xyz;
            light += shades[i] * max(dot(normal, normalize(way)), 0.0) / (0.5 + dot(way, way));
        }
        light *= texelFetch(colours, pixel, 0).rgb;
        result = vec4(place.w > 0.0 ? light : vec3(0.1, 0.1, 0.15), 1.0);
    })";

constexpr int kPlainMark = __LINE__;
Picture DrawPlain(GLuint target) {
    GLuint textures[3] = {}; // colours, normals, places
    glGenTextures(3, textures);
    for (int i = 0; i < 3; ++i) {
        GLint const format = i == 0 ? GL_RGBA8 : GL_RGBA16F;
        glBindTexture(GL_TEXTURE_2D, textures[i]);
        glTexImage2D(GL_TEXTURE_2D, 0, format, kSide, kSide, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
        glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_NEAREST);
        glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_NEAREST);
    }
    plain::Check("textures");
    GLuint depth = 0, seen = 0, array = 0;
    glGenRenderbuffers(1, &depth);
    glBindRenderbuffer(GL_RENDERBUFFER, depth);
    glRenderbufferStorage(GL_RENDERBUFFER, GL_DEPTH_COMPONENT24, kSide, kSide);
    glGenFramebuffers(1, &seen);
    glBindFramebuffer(GL_FRAMEBUFFER, seen);
    GLenum const outputs[] = {GL_COLOR_ATTACHMENT0, GL_COLOR_ATTACHMENT1, GL_COLOR_ATTACHMENT2};
    for (int i = 0; i < 3; ++i)
        glFramebufferTexture2D(GL_FRAMEBUFFER, outputs[i], GL_TEXTURE_2D, textures[i], 0);
    glFramebufferRenderbuffer(GL_FRAMEBUFFER, GL_DEPTH_ATTACHMENT, GL_RENDERBUFFER, depth);
    glDrawBuffers(3, outputs);
    plain::CheckFramebuffer("what is seen");
    glGenVertexArrays(1, &array); // without it a core context draws nothing
    glBindVertexArray(array);

    GLuint const ball = plain::MakeProgram(kBallVertexShader, kBallShader);
    GLuint const light = plain::MakeProgram(kWholeVertexShader, kLightShader);
    glEnable(GL_DEPTH_TEST);
    glClearColor(0, 0, 0, 0);
    glClear(GL_COLOR_BUFFER_BIT | GL_DEPTH_BUFFER_BIT);
    glUseProgram(ball);
    glDrawArraysInstanced(GL_TRIANGLE_STRIP, 0, 4, kBalls);
    glDisable(GL_DEPTH_TEST);
    plain::Check("what is seen");

    glBindFramebuffer(GL_FRAMEBUFFER, target);
    glUseProgram(light);
    char const *const names[] = {"colours", "normals", "places"};
    for (int i = 0; i < 3; ++i) {
        glActiveTexture(GL_TEXTURE0 + static_cast<GLenum>(i));
        glBindTexture(GL_TEXTURE_2D, textures[i]);
        glUniform1i(glGetUniformLocation(light, names[i]), i);
    }
    glActiveTexture(GL_TEXTURE0);
    glDrawArrays(GL_TRIANGLES, 0, 3);
    Picture picture = ported::ReadBack(target);
    plain::Check("the picture");

    glUseProgram(0);
    glDeleteProgram(ball);
    glDeleteProgram(light);
    glDeleteVertexArrays(1, &array);
    glDeleteFramebuffers(1, &seen);
    glDeleteRenderbuffers(1, &depth);
    glDeleteTextures(3, textures);
    return picture;
}

constexpr int kPortedMark = __LINE__;
Picture DrawPorted(Framebuffer &target) {
    Texture2D colours(Texture::INTERNALFORMAT_RGBA8, kSide, kSide, false);
    Texture2D normals(Texture::INTERNALFORMAT_RGBA16F_ARB, kSide, kSide, false);
    Texture2D places(Texture::INTERNALFORMAT_RGBA16F_ARB, kSide, kSide, false);
    Renderbuffer depth(GL_DEPTH_COMPONENT24, kSide, kSide);
    Framebuffer seen;
    seen.bind();
    seen.attachTexture(colours, 0, Framebuffer::Color(0));
    seen.attachTexture(normals, 0, Framebuffer::Color(1));
    seen.attachTexture(places, 0, Framebuffer::Color(2));
    seen.attach(&depth, 0);
    seen.setDrawBuffers({Framebuffer::Color(0), Framebuffer::Color(1), Framebuffer::Color(2)});
    VertexArray const corners;

    Program ball = ported::MakeProgram(kBallVertexShader, kBallShader);
    Program light = ported::MakeProgram(kWholeVertexShader, kLightShader);
    float const nothing[4] = {};
    for (unsigned int i = 0; i < 3; ++i)
        Framebuffer::ClearColor(&seen, i, nothing, nullptr);
    Framebuffer::ClearDepth(&seen, 1, nullptr);
    {
        TemporaryDepthScope const nearest([](DepthState &state) { state.enabled = 1; });
        ProgramEnabledScope const enabled(&ball);
        corners.drawArraysInstanced(GL_TRIANGLE_STRIP, 0, 4, kBalls);
    }

    target.bind();
    ProgramEnabledScope const enabled(&light);
    Texture2D const *const textures[] = {&colours, &normals, &places};
    char const *const names[] = {"colours", "normals", "places"};
    for (int i = 0; i < 3; ++i) {
        TextureState::SetActiveTextureUnit(static_cast<unsigned int>(i));
        TextureUnit::Unit(static_cast<unsigned int>(i))->bind(textures[i]);
        light.setUniformSampler2D(names[i], i);
    }
    TextureState::SetActiveTextureUnit(0);
    corners.drawArrays(GL_TRIANGLES, 0, 3);
    return ported::ReadBack(target.objectID());
}

constexpr int kEndMark = __LINE__;

} // namespace

ported::Comparison const ported::kDeferredShader = {
    "deferred_shader", DrawPlain, DrawPorted, {kPlainMark, kPortedMark, kEndMark}};
