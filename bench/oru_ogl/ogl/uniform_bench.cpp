// What a uniform setter costs over the raw call with its error query.
#include "bench/comparison.h"
#include "bench/glcontext.h"

#include "oru/oru_ogl/ogl/programogl.h"

using namespace ORU::OGL;
using oru_bench::Compare;
using oru_bench::EntryPoint;
using oru_bench::ThreadContext;

namespace {

int const kCalls = 2000;

/// A context with a program current that has a float, a vector and a matrix.
class Fixture {
public:
    Fixture() {
        char const *const source = "uniform float one; uniform vec4 four; uniform mat4 matrix;"
                                   "void main() { gl_Position = matrix * four * one; }";
        program.loadVertexShader(1, &source, nullptr);
        program.link(true);
        program.enable();
    }

    ThreadContext context;
    Program program;
};

float const kMatrix[16] = {1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1};

void UnsafeFloat(benchmark::State &state) {
    Fixture fixture;
    GLint const location = fixture.program.getUniformLocation("one");
    auto const uniform1f = EntryPoint<PFNGLUNIFORM1FPROC>("glUniform1f");
    Compare(
        state, kCalls,
        [=] {
            uniform1f(location, 0.5f);
            benchmark::DoNotOptimize(::glGetError());
        },
        [&] { fixture.program.setUniform_Unsafe(location, 0.5f); });
}
BENCHMARK(UnsafeFloat)->UseManualTime()->Iterations(1000);

void UnsafeVector(benchmark::State &state) {
    Fixture fixture;
    GLint const location = fixture.program.getUniformLocation("four");
    auto const uniform4f = EntryPoint<PFNGLUNIFORM4FPROC>("glUniform4f");
    Compare(
        state, kCalls,
        [=] {
            uniform4f(location, 1, 2, 3, 4);
            benchmark::DoNotOptimize(::glGetError());
        },
        [&] { fixture.program.setUniform_Unsafe(location, 1.f, 2.f, 3.f, 4.f); });
}
BENCHMARK(UnsafeVector)->UseManualTime()->Iterations(1000);

void UnsafeMatrix(benchmark::State &state) {
    Fixture fixture;
    GLint const location = fixture.program.getUniformLocation("matrix");
    auto const matrix4 = EntryPoint<PFNGLUNIFORMMATRIX4FVPROC>("glUniformMatrix4fv");
    Compare(
        state, kCalls,
        [=] {
            matrix4(location, 1, GL_FALSE, kMatrix);
            benchmark::DoNotOptimize(::glGetError());
        },
        [&] { fixture.program.setUniformMatrix4_Unsafe(location, kMatrix, GL_FALSE); });
}
BENCHMARK(UnsafeMatrix)->UseManualTime()->Iterations(1000);

// The guarded setter against the same questions asked raw.
void GuardedFloat(benchmark::State &state) {
    Fixture fixture;
    GLint const location = fixture.program.getUniformLocation("one");
    auto const uniform1f = EntryPoint<PFNGLUNIFORM1FPROC>("glUniform1f");
    Compare(
        state, kCalls,
        [=] {
            GLint current = 0;
            ::glGetIntegerv(GL_CURRENT_PROGRAM, &current);
            benchmark::DoNotOptimize(::glGetError());
            benchmark::DoNotOptimize(current);
            uniform1f(location, 0.5f);
            benchmark::DoNotOptimize(::glGetError());
        },
        [&] { fixture.program.setUniform(location, 0.5f); });
}
BENCHMARK(GuardedFloat)->UseManualTime()->Iterations(1000);

// By name: the look-up is most of it.
void UnsafeFloatByName(benchmark::State &state) {
    Fixture fixture;
    GLint program = 0;
    ::glGetIntegerv(GL_CURRENT_PROGRAM, &program);
    auto const find = EntryPoint<PFNGLGETUNIFORMLOCATIONPROC>("glGetUniformLocation");
    auto const uniform1f = EntryPoint<PFNGLUNIFORM1FPROC>("glUniform1f");
    Compare(
        state, kCalls,
        [=] {
            GLint const location = find(static_cast<GLuint>(program), "one");
            benchmark::DoNotOptimize(::glGetError());
            uniform1f(location, 0.5f);
            benchmark::DoNotOptimize(::glGetError());
        },
        [&] { fixture.program.setUniform_Unsafe("one", 0.5f); });
}
BENCHMARK(UnsafeFloatByName)->UseManualTime()->Iterations(1000);

} // namespace
