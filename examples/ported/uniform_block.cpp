// A uniform block: all values of a scene in one buffer, and two scenes in one picture.
#include "examples/ported/plaingl.h"
#include "examples/ported/ported.h"

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/uniformblockwriter.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

#include <cstring>

using namespace ORU::OGL;
using ported::kSide;
using ported::Picture;

namespace {

constexpr int kDiscs = 5;

// A triangle that covers everything.
char const *const kVertexShader = R"(#version 330
    out vec2 place;
    void main() {
        place = vec2(gl_VertexID % 2, gl_VertexID / 2) * 4.0 - 1.0;
        gl_Position = vec4(place, 0.0, 1.0);
    })";

char const *const kFragmentShader = R"(#version 330
    layout(std140) uniform Scene {
        vec3 background;
        float softness;
        vec2 middles[5];
        vec3 paints[5];
        mat2 turn;
        int count;
    };
    in vec2 place;
    out vec4 result;
    void main() {
        vec3 colour = background;
        for (int i = 0; i < count; ++i) {
            float inside = 0.4 - distance(turn * place, middles[i]);
            colour = mix(colour, paints[i], smoothstep(0.0, softness, inside));
        }
        result = vec4(colour, 1.0);
    })";

struct Scene {
    float background[3];
    float softness;
    int discs;
    float turn[2][2];
};
Scene const kScenes[] = {{{0.9f, 0.9f, 0.8f}, 0.02f, 4, {{1, 0}, {0, 1}}},
                         {{0.1f, 0.1f, 0.2f}, 0.4f, 5, {{0.6f, 0.8f}, {-0.8f, 0.6f}}}};
float const kMiddles[kDiscs][2] = {
    {0.4f, 0.4f}, {-0.4f, 0.4f}, {-0.4f, -0.4f}, {0.4f, -0.4f}, {0, 0}};
float const kPaints[kDiscs][3] = {
    {0.9f, 0.3f, 0.2f}, {0.2f, 0.6f, 0.9f}, {0.3f, 0.8f, 0.3f}, {0.9f, 0.8f, 0.2f}, {1, 1, 1}};

constexpr int kPlainMark = __LINE__;
/// The block as std140 lays it out, by hand.
struct PlainScene {
    GLfloat background[3];
    GLfloat softness;
    GLfloat middles[kDiscs][4]; // each element of an array takes 16 bytes
    GLfloat paints[kDiscs][4];
    GLfloat turn[2][4]; // each column, too
    GLint count;
    GLint unused[3];
};

PlainScene Fill(Scene const &scene) {
    PlainScene filled = {};
    std::memcpy(filled.background, scene.background, sizeof filled.background);
    filled.softness = scene.softness;
    for (int i = 0; i < kDiscs; ++i) {
        std::memcpy(filled.middles[i], kMiddles[i], sizeof kMiddles[i]);
        std::memcpy(filled.paints[i], kPaints[i], sizeof kPaints[i]);
    }
    for (int column = 0; column < 2; ++column)
        std::memcpy(filled.turn[column], scene.turn[column], sizeof scene.turn[column]);
    filled.count = scene.discs;
    return filled;
}

Picture DrawPlain(GLuint target) {
    GLuint array = 0, scenes = 0;
    glGenVertexArrays(1, &array);
    glBindVertexArray(array);

    GLuint const program = plain::MakeProgram(kVertexShader, kFragmentShader);
    GLuint const block = glGetUniformBlockIndex(program, "Scene");
    if (block == GL_INVALID_INDEX)
        throw std::runtime_error("the program has no block Scene");
    GLint size = 0, alignment = 1;
    glGetActiveUniformBlockiv(program, block, GL_UNIFORM_BLOCK_DATA_SIZE, &size);
    if (size > static_cast<GLint>(sizeof(PlainScene)))
        throw std::runtime_error("the block Scene is not as it is laid out here");
    glUniformBlockBinding(program, block, 0);
    glGetIntegerv(GL_UNIFORM_BUFFER_OFFSET_ALIGNMENT, &alignment);
    GLsizeiptr const bytes = sizeof(PlainScene);
    GLsizeiptr const step = (bytes + alignment - 1) / alignment * alignment;
    glGenBuffers(1, &scenes);
    glBindBuffer(GL_UNIFORM_BUFFER, scenes);
    glBufferData(GL_UNIFORM_BUFFER, 2 * step, nullptr, GL_STATIC_DRAW);
    for (int i = 0; i < 2; ++i) {
        PlainScene const filled = Fill(kScenes[i]);
        glBufferSubData(GL_UNIFORM_BUFFER, i * step, bytes, &filled);
    }
    plain::Check("scenes");

    glUseProgram(program);
    for (int i = 0; i < 2; ++i) {
        glBindBufferRange(GL_UNIFORM_BUFFER, 0, scenes, i * step, bytes);
        glViewport(i * kSide / 2, 0, kSide / 2, kSide);
        glDrawArrays(GL_TRIANGLES, 0, 3);
    }
    Picture picture = ported::ReadBack(target);
    plain::Check("picture");

    glUseProgram(0);
    glDeleteProgram(program);
    glDeleteBuffers(1, &scenes);
    glDeleteVertexArrays(1, &array);
    return picture;
}

constexpr int kPortedMark = __LINE__;
Picture DrawPorted(Framebuffer &target) {
    VertexArray const corners;
    Program program = ported::MakeProgram(kVertexShader, kFragmentShader);
    UniformBlock const block(program, "Scene");
    block.setBinding(0);
    std::int64_t const alignment = UniformBlock::OffsetAlignment();
    std::int64_t const step = (block.size() + alignment - 1) / alignment * alignment;
    Buffer scenes(2 * step, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr);
    UniformBlockWriter values(block);
    values.set("middles", kMiddles[0], kDiscs);
    values.set("paints", kPaints[0], kDiscs);
    for (int i = 0; i < 2; ++i) {
        values.set("background", kScenes[i].background, 1);
        values.set("softness", kScenes[i].softness);
        values.set("turn", kScenes[i].turn[0], 1);
        values.set("count", kScenes[i].discs);
        values.upload(scenes, i * step);
    }

    ProgramEnabledScope const enabled(&program);
    for (int i = 0; i < 2; ++i) {
        scenes.bindRange(GL_UNIFORM_BUFFER, 0, i * step, block.size());
        TemporaryViewportScope const half({i * kSide / 2, 0, kSide / 2, kSide});
        corners.drawArrays(GL_TRIANGLES, 0, 3);
    }
    return ported::ReadBack(target.objectID());
}

constexpr int kEndMark = __LINE__;

} // namespace

ported::Comparison const ported::kUniformBlock = {
    "uniform_block", DrawPlain, DrawPorted, {kPlainMark, kPortedMark, kEndMark}};
