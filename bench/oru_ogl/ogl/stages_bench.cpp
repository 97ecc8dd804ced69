// State scopes, pipelines, feedback and program binaries against the raw calls.
#include "bench/comparison.h"
#include "bench/glcontext.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/programpipeline.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/transformfeedback.h"
#include "oru/oru_ogl/ogl/transformfeedbackscope.h"

using namespace ORU::OGL;
using oru_bench::Compare;
using oru_bench::EntryPoint;
using oru_bench::ThreadContext;

namespace {

constexpr int kCalls = 1000;

void Viewport(benchmark::State &state) {
    ThreadContext const context;
    Compare(
        state, kCalls,
        [] {
            GLint found[4];
            ORU_PLAIN(::glGetIntegerv(GL_VIEWPORT, found));
            ORU_PLAIN(::glViewport(1, 2, 30, 40));
            ORU_PLAIN(::glViewport(found[0], found[1], found[2], found[3]));
        },
        [] {
            TemporaryViewportScope const scope({1, 2, 30, 40});
        });
}

void Depth(benchmark::State &state) {
    ThreadContext const context;
    Compare(
        state, kCalls,
        [] {
            GLint isOn, writes, function;
            ORU_PLAIN(::glGetIntegerv(GL_DEPTH_TEST, &isOn));
            ORU_PLAIN(::glGetIntegerv(GL_DEPTH_WRITEMASK, &writes));
            ORU_PLAIN(::glGetIntegerv(GL_DEPTH_FUNC, &function));
            ORU_PLAIN(::glEnable(GL_DEPTH_TEST));
            ORU_PLAIN(::glDepthMask(GL_FALSE));
            ORU_PLAIN(::glDepthFunc(GL_LEQUAL));
            ORU_PLAIN(::glDisable(GL_DEPTH_TEST));
            ORU_PLAIN(::glDepthMask(static_cast<GLboolean>(writes)));
            ORU_PLAIN(::glDepthFunc(static_cast<GLenum>(function)));
        },
        [] {
            TemporaryDepthScope const scope({1, 0, GL_LEQUAL});
        });
}

constexpr char kVertex[] = "#version 150\n#extension GL_ARB_separate_shader_objects : enable\n"
                           "out gl_PerVertex { vec4 gl_Position; }; out float number;"
                           "void main() { number = float(gl_VertexID); gl_Position = vec4(0.0); }";

void Pipeline(benchmark::State &state) {
    ThreadContext const context;
    Program const program = Program::Separable(Shader::SHADERTYPE_VERTEX, kVertex);
    ProgramPipeline pipeline;
    pipeline.useStages(ProgramPipeline::STAGE_VERTEX, program);
    auto const bind = EntryPoint<PFNGLBINDPROGRAMPIPELINEPROC>("glBindProgramPipeline");
    GLuint const name = pipeline.objectID();
    Compare(
        state, kCalls,
        [&] {
            ORU_PLAIN(bind(name));
            ORU_PLAIN(bind(0));
        },
        [&] {
            pipeline.bind();
            ProgramPipeline::BindDefault();
        });
}

void Feedback(benchmark::State &state) {
    ThreadContext const context;
    Program program;
    program.loadVertexShader(kVertex);
    program.setFeedbackVaryings({"number"}, Program::FEEDBACKMODE_INTERLEAVED);
    program.link(true);
    program.enable();
    Buffer const buffer(4096, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_DYNAMIC_COPY, nullptr);
    TransformFeedback feedback;
    feedback.setBuffer(0, buffer);
    auto const bind = EntryPoint<PFNGLBINDTRANSFORMFEEDBACKPROC>("glBindTransformFeedback");
    auto const begin = EntryPoint<PFNGLBEGINTRANSFORMFEEDBACKPROC>("glBeginTransformFeedback");
    auto const end = EntryPoint<PFNGLENDTRANSFORMFEEDBACKPROC>("glEndTransformFeedback");
    GLuint const name = feedback.objectID();
    Compare(
        state, 100,
        [&] {
            GLint previous = 0;
            ORU_PLAIN(::glGetIntegerv(GL_TRANSFORM_FEEDBACK_BINDING, &previous));
            ORU_PLAIN(bind(GL_TRANSFORM_FEEDBACK, name));
            ORU_PLAIN(begin(GL_POINTS));
            ORU_PLAIN(end());
            ORU_PLAIN(bind(GL_TRANSFORM_FEEDBACK, static_cast<GLuint>(previous)));
        },
        [&] { TransformFeedbackScope const capture(feedback, GL_POINTS); });
    program.disable();
}

void Binary(benchmark::State &state) {
    ThreadContext const context;
    if (!Program::SupportsBinaries()) {
        state.SkipWithError("this driver makes no binaries");
        return;
    }
    Program program;
    program.loadVertexShader(kVertex);
    program.link(true);
    auto const bytes = program.saveBinary();
    auto const get = EntryPoint<PFNGLGETPROGRAMBINARYPROC>("glGetProgramBinary");
    auto const put = EntryPoint<PFNGLPROGRAMBINARYPROC>("glProgramBinary");
    auto const ask = EntryPoint<PFNGLGETPROGRAMIVPROC>("glGetProgramiv");
    std::vector<unsigned char> code(bytes.size());
    GLsizei size = 0;
    GLenum format = 0;
    get(program.programID(), static_cast<GLsizei>(code.size()), &size, &format, code.data());
    Compare(
        state, 10,
        [&] {
            ORU_PLAIN(put(program.programID(), format, code.data(), size));
            GLint isLinked = 0;
            ORU_PLAIN(ask(program.programID(), GL_LINK_STATUS, &isLinked));
        },
        [&] { benchmark::DoNotOptimize(program.loadBinary(bytes.data(), bytes.size())); });
}

void Times(benchmark::internal::Benchmark *benchmark) {
    benchmark->UseManualTime()->MinTime(0.3)->Unit(benchmark::kMicrosecond);
}

BENCHMARK(Viewport)->Apply(Times);
BENCHMARK(Depth)->Apply(Times);
BENCHMARK(Pipeline)->Apply(Times);
BENCHMARK(Feedback)->Apply(Times);
BENCHMARK(Binary)->Apply(Times);

} // namespace
