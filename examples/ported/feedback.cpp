// Transform feedback: sparks move on the GPU, those that fall out of the picture are dropped, and
// what is left is drawn, its number unknown to the host.
#include "examples/ported/plaingl.h"
#include "examples/ported/ported.h"

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/switchscope.h"
#include "oru/oru_ogl/ogl/transformfeedback.h"
#include "oru/oru_ogl/ogl/transformfeedbackscope.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

#include <cmath>

using namespace ORU::OGL;
using ported::Picture;

namespace {

constexpr int kSparks = 60, kSteps = 40;

char const *const kMoveVertexShader = R"(#version 330
    layout(location = 0) in vec4 spark; // place, speed
    out vec4 moved;
    void main() {
        vec2 speed = spark.zw - vec2(0.0, 0.004);
        moved = vec4(spark.xy + speed, speed);
    })";

char const *const kMoveGeometryShader = R"(#version 330
    layout(points) in;
    layout(points, max_vertices = 1) out;
    in vec4 moved[];
    out vec4 kept;
    void main() {
        if (all(lessThan(abs(moved[0].xy), vec2(1.0)))) {
            kept = moved[0];
            EmitVertex();
        }
    })";

char const *const kDrawVertexShader = R"(#version 330
    layout(location = 0) in vec4 spark;
    out vec3 shade;
    void main() {
        shade = mix(vec3(0.9, 0.2, 0.1), vec3(1.0, 0.9, 0.4), 25.0 * length(spark.zw));
        gl_Position = vec4(spark.xy, 0.0, 1.0);
    })";

char const *const kDrawShader = R"(#version 330
    in vec3 shade;
    out vec4 colour;
    void main() { colour = vec4(shade, 1.0); })";

/// Place and speed of each spark, of two fountains.
std::vector<float> Sparks() {
    std::vector<float> sparks;
    for (int i = 0; i < kSparks; ++i) {
        float const angle = 0.7f + 1.7f * static_cast<float>(i) / kSparks;
        float const speed = 0.03f + 0.002f * static_cast<float>(i * 7 % 11);
        sparks.insert(sparks.end(), {i % 2 == 0 ? -0.4f : 0.4f, -0.9f, speed * std::cos(angle),
                                     2 * speed * std::sin(angle)});
    }
    return sparks;
}

constexpr int kPlainMark = __LINE__;
Picture DrawPlain(GLuint target) {
    GLuint const move = plain::MakeProgram(kMoveVertexShader, nullptr, kMoveGeometryShader, "kept");
    GLuint const draw = plain::MakeProgram(kDrawVertexShader, kDrawShader);
    auto const sparks = Sparks();
    GLuint buffers[2] = {}, arrays[2] = {}, feedbacks[2] = {};
    glGenBuffers(2, buffers);
    glGenVertexArrays(2, arrays);
    glGenTransformFeedbacks(2, feedbacks);
    for (int i = 0; i < 2; ++i) {
        glBindVertexArray(arrays[i]);
        glBindBuffer(GL_ARRAY_BUFFER, buffers[i]);
        glBufferData(GL_ARRAY_BUFFER, static_cast<GLsizeiptr>(sparks.size() * sizeof(float)),
                     sparks.data(), GL_DYNAMIC_COPY);
        glVertexAttribPointer(0, 4, GL_FLOAT, GL_FALSE, 0, nullptr);
        glEnableVertexAttribArray(0);
        glBindTransformFeedback(GL_TRANSFORM_FEEDBACK, feedbacks[i]);
        glBindBufferBase(GL_TRANSFORM_FEEDBACK_BUFFER, 0, buffers[i]);
    }
    plain::Check("sparks");

    for (int step = 0; step < kSteps; ++step) {
        int const from = step % 2, to = 1 - from;
        glUseProgram(move);
        glBindVertexArray(arrays[from]);
        glBindTransformFeedback(GL_TRANSFORM_FEEDBACK, feedbacks[to]);
        glEnable(GL_RASTERIZER_DISCARD);
        glBeginTransformFeedback(GL_POINTS);
        if (step == 0)
            glDrawArrays(GL_POINTS, 0, kSparks);
        else
            glDrawTransformFeedback(GL_POINTS, feedbacks[from]);
        glEndTransformFeedback();
        glDisable(GL_RASTERIZER_DISCARD);
        glUseProgram(draw);
        glBindVertexArray(arrays[to]);
        glDrawTransformFeedback(GL_POINTS, feedbacks[to]);
        plain::Check("a step");
    }
    Picture picture = ported::ReadBack(target);
    plain::Check("picture");

    glBindTransformFeedback(GL_TRANSFORM_FEEDBACK, 0);
    glDeleteProgram(move);
    glDeleteProgram(draw);
    glDeleteTransformFeedbacks(2, feedbacks);
    glDeleteVertexArrays(2, arrays);
    glDeleteBuffers(2, buffers);
    return picture;
}

constexpr int kPortedMark = __LINE__;
/// Sparks in a buffer, which are drawn and captured.
struct Swarm {
    explicit Swarm(std::vector<float> const &sparks)
        : buffer(static_cast<std::int64_t>(sparks.size() * sizeof(float)),
                 Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_DYNAMIC_COPY, sparks.data()) {
        array.setAttribute(0, buffer, {4, GL_FLOAT});
        feedback.setBuffer(0, buffer);
    }

    Buffer buffer;
    VertexArray array;
    TransformFeedback feedback;
};

Picture DrawPorted(Framebuffer &target) {
    Program move, draw = ported::MakeProgram(kDrawVertexShader, kDrawShader);
    move.loadVertexShader(kMoveVertexShader);
    move.loadGeometryShader(kMoveGeometryShader);
    move.setFeedbackVaryings({"kept"}, Program::FEEDBACKMODE_INTERLEAVED);
    move.link(true);
    auto const sparks = Sparks();
    Swarm swarms[] = {Swarm(sparks), Swarm(sparks)};

    for (int step = 0; step < kSteps; ++step) {
        Swarm &from = swarms[step % 2], &to = swarms[1 - step % 2];
        from.array.bind();
        {
            ProgramEnabledScope const enabled(&move);
            TemporarySwitchScope const unseen(GL_RASTERIZER_DISCARD, true);
            TransformFeedbackScope const capture(to.feedback, GL_POINTS);
            if (step == 0)
                from.array.drawArrays(GL_POINTS, 0, kSparks);
            else
                from.feedback.draw(GL_POINTS);
        }
        ProgramEnabledScope const enabled(&draw);
        to.array.bind();
        to.feedback.draw(GL_POINTS);
    }
    return ported::ReadBack(target.objectID());
}

constexpr int kEndMark = __LINE__;

} // namespace

ported::Comparison const ported::kFeedback = {
    "feedback", DrawPlain, DrawPorted, {kPlainMark, kPortedMark, kEndMark}};
