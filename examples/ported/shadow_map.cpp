// A shadow map: what a lamp sees, as a texture of depths that the shader compares with.
#include "examples/ported/plaingl.h"
#include "examples/ported/ported.h"

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

#include <array>
#include <cmath>

using namespace ORU::OGL;
using ported::kSide;
using ported::Picture;

namespace {

constexpr int kShadowSide = 256;

char const *const kVertexShader = R"(#version 330
    uniform mat4 camera, lamp;
    uniform vec3 middle, size;
    layout(location = 0) in vec3 corner;
    out vec3 place;
    out vec3 seenByLamp;
    void main() {
        place = middle + size * corner;
        seenByLamp = 0.5 + 0.5 * (lamp * vec4(place, 1.0)).xyz;
        gl_Position = camera * vec4(place, 1.0);
    })";

char const *const kDepthShader = "#version 330\nvoid main() {}";

char const *const kSceneShader = R"(#version 330
    uniform sampler2DShadow shadows;
    uniform vec3 paint, toLamp;
    in vec3 place;
    in vec3 seenByLamp;
    out vec4 colour;
    void main() {
        vec3 normal = normalize(cross(dFdx(place), dFdy(place)));
        float light = max(dot(normal, toLamp), 0.0) * texture(shadows, seenByLamp);
        colour = vec4(paint * (0.25 + 0.75 * light), 1.0);
    })";

using Vector = std::array<float, 3>;
using Matrix = std::array<float, 16>;

/// Seen from far away in a direction, without perspective.
Matrix LookFrom(Vector const &d) {
    float const h = std::hypot(d[0], d[2]), scale = 0.65f;
    Vector const right = {d[2] / h, 0, -d[0] / h};
    Vector const up = {-d[0] * d[1] / h, h, -d[1] * d[2] / h};
    Matrix matrix = {};
    for (std::size_t i = 0; i < 3; ++i) {
        matrix[4 * i] = scale * right[i];
        matrix[4 * i + 1] = scale * up[i];
        matrix[4 * i + 2] = -scale * d[i];
    }
    matrix[15] = 1;
    return matrix;
}

Vector const kToLamp = {0.64f, 0.6f, -0.48f}; // of length 1
Matrix const kLamp = LookFrom(kToLamp), kEye = LookFrom({0.6f, 0.48f, 0.64f});

struct Box {
    float middle[3], size[3], paint[3];
};
Box const kBoxes[] = {{{0, -0.1f, 0}, {1, 0.1f, 1}, {0.9f, 0.85f, 0.7f}},
                      {{-0.3f, 0.45f, 0.5f}, {0.2f, 0.45f, 0.2f}, {0.9f, 0.3f, 0.2f}},
                      {{0.5f, 0.25f, -0.6f}, {0.25f, 0.25f, 0.25f}, {0.3f, 0.6f, 0.9f}},
                      {{-0.2f, 0.5f, -0.4f}, {0.3f, 0.1f, 0.1f}, {0.4f, 0.8f, 0.4f}}};

float const kCorners[] = {-1, -1, -1, 1, -1, -1, -1, 1, -1, 1, 1, -1,
                          -1, -1, 1,  1, -1, 1,  -1, 1, 1,  1, 1, 1};
unsigned char const kTriangles[] = {1, 3, 7, 1, 7, 5, 0, 4, 6, 0, 6, 2, 2, 6, 7, 2, 7, 3,
                                    0, 1, 5, 0, 5, 4, 4, 5, 7, 4, 7, 6, 0, 2, 3, 0, 3, 1};
constexpr int kIndices = sizeof kTriangles;

constexpr int kPlainMark = __LINE__;
Picture DrawPlain(GLuint target) {
    GLuint array = 0, buffers[2] = {};
    glGenVertexArrays(1, &array);
    glBindVertexArray(array);
    glGenBuffers(2, buffers);
    glBindBuffer(GL_ARRAY_BUFFER, buffers[0]);
    glBufferData(GL_ARRAY_BUFFER, sizeof kCorners, kCorners, GL_STATIC_DRAW);
    glVertexAttribPointer(0, 3, GL_FLOAT, GL_FALSE, 0, nullptr);
    glEnableVertexAttribArray(0);
    glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, buffers[1]);
    glBufferData(GL_ELEMENT_ARRAY_BUFFER, sizeof kTriangles, kTriangles, GL_STATIC_DRAW);
    plain::Check("vertices");

    GLuint shadows = 0;
    glGenTextures(1, &shadows);
    glBindTexture(GL_TEXTURE_2D, shadows);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_DEPTH_COMPONENT24, kShadowSide, kShadowSide, 0,
                 GL_DEPTH_COMPONENT, GL_UNSIGNED_INT, nullptr);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, GL_CLAMP_TO_EDGE);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_T, GL_CLAMP_TO_EDGE);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_COMPARE_MODE, GL_COMPARE_REF_TO_TEXTURE);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_COMPARE_FUNC, GL_LEQUAL);
    GLuint lamp = 0;
    glGenFramebuffers(1, &lamp);
    glBindFramebuffer(GL_FRAMEBUFFER, lamp);
    glFramebufferTexture2D(GL_FRAMEBUFFER, GL_DEPTH_ATTACHMENT, GL_TEXTURE_2D, shadows, 0);
    glDrawBuffer(GL_NONE);
    glReadBuffer(GL_NONE);
    plain::CheckFramebuffer("shadow map");

    GLuint const depths = plain::MakeProgram(kVertexShader, kDepthShader);
    GLuint const scene = plain::MakeProgram(kVertexShader, kSceneShader);
    auto const drawBoxes = [](GLuint program, Matrix const &camera) {
        glUseProgram(program);
        glUniformMatrix4fv(glGetUniformLocation(program, "camera"), 1, GL_FALSE, camera.data());
        glUniformMatrix4fv(glGetUniformLocation(program, "lamp"), 1, GL_FALSE, kLamp.data());
        glUniform3fv(glGetUniformLocation(program, "toLamp"), 1, kToLamp.data());
        for (Box const &box : kBoxes) {
            glUniform3fv(glGetUniformLocation(program, "middle"), 1, box.middle);
            glUniform3fv(glGetUniformLocation(program, "size"), 1, box.size);
            glUniform3fv(glGetUniformLocation(program, "paint"), 1, box.paint);
            glDrawElements(GL_TRIANGLES, kIndices, GL_UNSIGNED_BYTE, nullptr);
        }
    };
    glEnable(GL_DEPTH_TEST);
    glEnable(GL_CULL_FACE);
    glCullFace(GL_FRONT); // the far sides, so that no near one shadows itself
    glViewport(0, 0, kShadowSide, kShadowSide);
    glClear(GL_DEPTH_BUFFER_BIT);
    drawBoxes(depths, kLamp);
    glDisable(GL_CULL_FACE);
    glCullFace(GL_BACK);
    plain::Check("shadows");

    glBindFramebuffer(GL_FRAMEBUFFER, target);
    glViewport(0, 0, kSide, kSide);
    drawBoxes(scene, kEye);
    glDisable(GL_DEPTH_TEST);
    Picture picture = ported::ReadBack(target);
    plain::Check("scene");

    glUseProgram(0);
    glDeleteProgram(depths);
    glDeleteProgram(scene);
    glDeleteFramebuffers(1, &lamp);
    glDeleteTextures(1, &shadows);
    glDeleteVertexArrays(1, &array);
    glDeleteBuffers(2, buffers);
    return picture;
}

constexpr int kPortedMark = __LINE__;
Picture DrawPorted(Framebuffer &target) {
    Buffer const corners(sizeof kCorners, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW,
                         kCorners);
    Buffer const triangles(sizeof kTriangles, Buffer::TYPE_ELEMENT_ARRAY_BUFFER,
                           Buffer::USAGE_STATIC_DRAW, kTriangles);
    VertexArray box;
    box.setAttribute(0, corners, {3, GL_FLOAT});
    box.setIndices(triangles, GL_UNSIGNED_BYTE);

    Texture2D shadows(Texture::INTERNALFORMAT_DEPTH_COMPONENT24, kShadowSide, kShadowSide, false);
    TextureUnit::Unit(0)->bind(&shadows);
    shadows.setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
    shadows.setCompare(Texture::COMPARE_LEQUAL);
    Framebuffer lamp;
    lamp.bind();
    lamp.attachTexture(shadows, 0, Framebuffer::ATTACHMENT_DEPTH);
    lamp.setDrawBuffers({Framebuffer::ATTACHMENT_NONE});
    lamp.setReadBuffer(Framebuffer::ATTACHMENT_NONE);

    Program depths = ported::MakeProgram(kVertexShader, kDepthShader);
    Program scene = ported::MakeProgram(kVertexShader, kSceneShader);
    auto const drawBoxes = [&box](Program &program, Matrix const &camera) {
        ProgramEnabledScope const enabled(&program);
        program.setUniformMatrix4("camera", camera.data(), false);
        program.setUniformMatrix4("lamp", kLamp.data(), false);
        program.setUniform3("toLamp", 1, kToLamp.data());
        for (Box const &one : kBoxes) {
            program.setUniform3("middle", 1, one.middle);
            program.setUniform3("size", 1, one.size);
            program.setUniform3("paint", 1, one.paint);
            box.drawElements(GL_TRIANGLES, kIndices);
        }
    };
    TemporaryDepthScope const depth([](DepthState &state) { state.enabled = 1; });
    {
        TemporaryViewportScope const whole({0, 0, kShadowSide, kShadowSide});
        TemporaryCullScope const farSides({1, GL_FRONT, GL_CCW}); // no near one shadows itself
        Framebuffer::ClearDepth(&lamp, 1, nullptr);
        drawBoxes(depths, kLamp);
    }

    target.bind();
    drawBoxes(scene, kEye);
    return ported::ReadBack(target.objectID());
}

constexpr int kEndMark = __LINE__;

} // namespace

ported::Comparison const ported::kShadowMap = {
    "shadow_map", DrawPlain, DrawPorted, {kPlainMark, kPortedMark, kEndMark}};
