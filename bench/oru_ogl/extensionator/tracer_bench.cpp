// What the tracer costs for each call, and what it costs while it is not pushed.
#include "bench/comparison.h"
#include "bench/glcontext.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/interceptorscope.h"
#include "oru/oru_ogl/extensionator/openglforwarder.h"
#include "oru/oru_ogl/extensionator/opengltracer.h"

#include <cstdio>
#include <fstream>
#include <ostream>
#include <streambuf>
#include <vector>

using namespace ORU::OGL;
using oru_bench::Comparison;
using oru_bench::Seconds;

namespace {

int const kCalls = 2000;

/// Takes everything and keeps nothing.
class Nowhere : public std::streambuf {
protected:
    std::streamsize xsputn(char const *, std::streamsize count) override { return count; }
    int_type overflow(int_type c) override { return traits_type::not_eof(c); }
};

/// Ends the chain without a call, so that only the tracer is measured.
class End : public OpenGLForwarder {
public:
    void cgmTexParameteri(char const *, unsigned int, GLenum, GLenum, GLint) override {}
    void cgmUniform4f(char const *, unsigned int, GLint, GLfloat, GLfloat, GLfloat,
                      GLfloat) override {}
    void cgmVertexAttribPointer(char const *, unsigned int, GLuint, GLint, GLenum, GLboolean,
                                GLsizei, void const *) override {}
};

void TexParameteri(OpenGLInterceptor &chain, int i) {
    chain.cgmTexParameteri(__FILE__, __LINE__, GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, 9728 + i % 2);
}

void Uniform4fWhole(OpenGLInterceptor &chain, int i) {
    chain.cgmUniform4f(__FILE__, __LINE__, 3, 1, 0, static_cast<float>(i), 255);
}

void Uniform4fFractions(OpenGLInterceptor &chain, int i) {
    float const x = static_cast<float>(i) * 0.37f;
    chain.cgmUniform4f(__FILE__, __LINE__, 3, x, 0.1f, -x, 1e-5f);
}

void VertexAttribPointer(OpenGLInterceptor &chain, int i) {
    chain.cgmVertexAttribPointer(__FILE__, __LINE__, 1, 4, GL_FLOAT, GL_FALSE, 32,
                                 reinterpret_cast<void const *>(std::intptr_t(16 * i)));
}

using Call = void (*)(OpenGLInterceptor &chain, int i);

/// The time of a call without the tracer and with it; `added_ns` is the tracer's.
void Trace(benchmark::State &state, Call call, std::ostream &stream) {
    End end;
    OpenGLTracer tracer(stream, &end);
    auto const repeat = [call](OpenGLInterceptor &chain) {
        return Seconds([&] {
            for (int i = 0; i < kCalls; ++i)
                call(chain, i);
        });
    };
    {
        Comparison comparison(state, kCalls);
        while (state.KeepRunning()) {
            double const without = repeat(end);
            double const with = repeat(tracer);
            comparison.add(without, with);
        }
    }
    state.counters["lines/s"] = 1e9 / state.counters["oru_ns"];
}

void LineToNowhere(benchmark::State &state, Call call) {
    Nowhere nowhere;
    std::ostream stream(&nowhere);
    Trace(state, call, stream);
}

/// @param bufferSize in bytes, 0 for what a file stream has of its own
void LineToFile(benchmark::State &state, Call call, std::size_t bufferSize) {
    char const *const name = "tracer_bench.txt";
    std::vector<char> buffer(bufferSize);
    {
        std::ofstream stream;
        if (bufferSize)
            stream.rdbuf()->pubsetbuf(buffer.data(), static_cast<std::streamsize>(bufferSize));
        stream.open(name, std::ios_base::binary);
        Trace(state, call, stream);
    }
    std::remove(name);
}

void LineToPlainFile(benchmark::State &state, Call call) {
    LineToFile(state, call, 0);
}

void LineToBufferedFile(benchmark::State &state, Call call) {
    LineToFile(state, call, 1 << 16);
}

#define ORU_TRACE_BENCHMARKS(Target)                                                               \
    BENCHMARK_CAPTURE(Target, TexParameteri, TexParameteri)->UseManualTime()->Iterations(500);     \
    BENCHMARK_CAPTURE(Target, VertexAttribPointer, VertexAttribPointer)                            \
        ->UseManualTime()                                                                          \
        ->Iterations(500);                                                                         \
    BENCHMARK_CAPTURE(Target, Uniform4fWhole, Uniform4fWhole)->UseManualTime()->Iterations(500);   \
    BENCHMARK_CAPTURE(Target, Uniform4fFractions, Uniform4fFractions)                              \
        ->UseManualTime()                                                                          \
        ->Iterations(500)

ORU_TRACE_BENCHMARKS(LineToNowhere);
ORU_TRACE_BENCHMARKS(LineToPlainFile);
ORU_TRACE_BENCHMARKS(LineToBufferedFile);

// A call before a tracer was ever pushed against the same call after one was pushed and popped.
void PoppedTracer(benchmark::State &state) {
    oru_bench::ThreadContext const context;
    // Through a pointer, so that both measurements run the same machine code.
    void (*calls)() = [] {
        for (int i = 0; i < kCalls; ++i)
            benchmark::DoNotOptimize(ORU_GL(IsEnabled, GL_BLEND));
    };
    benchmark::DoNotOptimize(calls);
    Nowhere nowhere;
    std::ostream stream(&nowhere);
    Comparison comparison(state, kCalls);
    while (state.KeepRunning()) {
        double const before = Seconds(calls);
        { InterceptorScope<OpenGLTracer> const tracer(stream); }
        comparison.add(before, Seconds(calls));
    }
}
BENCHMARK(PoppedTracer)->UseManualTime()->Iterations(500);

} // namespace
