// Instances: one mesh with indices, drawn 36 times with attributes that change by instance.
#include "examples/ported/plaingl.h"
#include "examples/ported/ported.h"

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

#include <cstddef>

using namespace ORU::OGL;
using ported::Picture;

namespace {

char const *const kVertexShader = R"(#version 330
    layout(location = 0) in vec2 corner;
    layout(location = 1) in vec2 middle;
    layout(location = 2) in float angle;
    layout(location = 3) in vec4 paint;
    out vec4 colour;
    void main() {
        mat2 turn = mat2(cos(angle), sin(angle), -sin(angle), cos(angle));
        colour = paint;
        gl_Position = vec4(middle + 0.15 * turn * corner, 0.0, 1.0);
    })";

char const *const kFragmentShader = R"(#version 330
    in vec4 colour;
    out vec4 result;
    void main() { result = colour; })";

// A star of four points around its middle.
float const kCorners[] = {0,    0,  1, 0,     0.3f,  0.3f, 0,  1,    -0.3f,
                          0.3f, -1, 0, -0.3f, -0.3f, 0,    -1, 0.3f, -0.3f};
unsigned short const kTriangles[] = {0, 1, 2, 0, 2, 3, 0, 3, 4, 0, 4, 5,
                                     0, 5, 6, 0, 6, 7, 0, 7, 8, 0, 8, 1};
constexpr int kIndices = sizeof kTriangles / sizeof *kTriangles;

struct Star {
    float middle[2];
    float angle;
    unsigned char paint[4];
};

std::vector<Star> Stars() {
    std::vector<Star> stars;
    for (int i = 0; i < 36; ++i) {
        int const column = i % 6, row = i / 6;
        auto const shade = [i](int factor) {
            return static_cast<unsigned char>(80 + i * factor % 176);
        };
        stars.push_back(
            {{0.32f * static_cast<float>(column) - 0.8f, 0.32f * static_cast<float>(row) - 0.8f},
             0.05f * static_cast<float>(i),
             {shade(5), shade(53), shade(91), 255}});
    }
    return stars;
}

constexpr int kPlainMark = __LINE__;
Picture DrawPlain(GLuint target) {
    auto const stars = Stars();
    GLuint array = 0, buffers[3] = {};
    glGenVertexArrays(1, &array);
    glBindVertexArray(array);
    glGenBuffers(3, buffers);
    glBindBuffer(GL_ARRAY_BUFFER, buffers[0]);
    glBufferData(GL_ARRAY_BUFFER, sizeof kCorners, kCorners, GL_STATIC_DRAW);
    glVertexAttribPointer(0, 2, GL_FLOAT, GL_FALSE, 0, nullptr);
    glBindBuffer(GL_ARRAY_BUFFER, buffers[1]);
    glBufferData(GL_ARRAY_BUFFER, static_cast<GLsizeiptr>(stars.size() * sizeof(Star)),
                 stars.data(), GL_STATIC_DRAW);
    glVertexAttribPointer(1, 2, GL_FLOAT, GL_FALSE, sizeof(Star),
                          reinterpret_cast<void *>(offsetof(Star, middle)));
    glVertexAttribPointer(2, 1, GL_FLOAT, GL_FALSE, sizeof(Star),
                          reinterpret_cast<void *>(offsetof(Star, angle)));
    glVertexAttribPointer(3, 4, GL_UNSIGNED_BYTE, GL_TRUE, sizeof(Star),
                          reinterpret_cast<void *>(offsetof(Star, paint)));
    for (GLuint location = 0; location < 4; ++location) {
        glEnableVertexAttribArray(location);
        glVertexAttribDivisor(location, location == 0 ? 0 : 1);
    }
    glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, buffers[2]);
    glBufferData(GL_ELEMENT_ARRAY_BUFFER, sizeof kTriangles, kTriangles, GL_STATIC_DRAW);
    glBindBuffer(GL_ARRAY_BUFFER, 0);
    plain::Check("vertices");

    GLuint const program = plain::MakeProgram(kVertexShader, kFragmentShader);
    glUseProgram(program);
    glDrawElementsInstanced(GL_TRIANGLES, kIndices, GL_UNSIGNED_SHORT, nullptr,
                            static_cast<GLsizei>(stars.size()));
    Picture picture = ported::ReadBack(target);
    plain::Check("picture");

    glUseProgram(0);
    glDeleteProgram(program);
    glDeleteVertexArrays(1, &array);
    glDeleteBuffers(3, buffers);
    return picture;
}

constexpr int kPortedMark = __LINE__;
Picture DrawPorted(Framebuffer &target) {
    auto const stars = Stars();
    Buffer const corners(sizeof kCorners, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW,
                         kCorners);
    Buffer const triangles(sizeof kTriangles, Buffer::TYPE_ELEMENT_ARRAY_BUFFER,
                           Buffer::USAGE_STATIC_DRAW, kTriangles);
    Buffer const instances(static_cast<std::int64_t>(stars.size() * sizeof(Star)),
                           Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, stars.data());
    auto const each = [](VertexArray::Attribute attribute, std::size_t offset) {
        return attribute.stride(sizeof(Star)).offset(static_cast<std::int64_t>(offset)).divisor(1);
    };
    VertexArray star;
    star.setAttribute(0, corners, {2, GL_FLOAT});
    star.setAttribute(1, instances, each({2, GL_FLOAT}, offsetof(Star, middle)));
    star.setAttribute(2, instances, each({1, GL_FLOAT}, offsetof(Star, angle)));
    star.setAttribute(
        3, instances,
        each(VertexArray::Attribute(4, GL_UNSIGNED_BYTE).normalized(), offsetof(Star, paint)));
    star.setIndices(triangles, GL_UNSIGNED_SHORT);

    Program program = ported::MakeProgram(kVertexShader, kFragmentShader);
    ProgramEnabledScope const enabled(&program);
    star.drawElementsInstanced(GL_TRIANGLES, kIndices, static_cast<int>(stars.size()));
    return ported::ReadBack(target.objectID());
}

constexpr int kEndMark = __LINE__;

} // namespace

ported::Comparison const ported::kInstances = {
    "instances", DrawPlain, DrawPorted, {kPlainMark, kPortedMark, kEndMark}};
