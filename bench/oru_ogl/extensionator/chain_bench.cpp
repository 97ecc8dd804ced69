// What a call through chain and error checker costs over the raw call with its error query.
#include "bench/comparison.h"
#include "bench/glcontext.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/interceptorscope.h"
#include "oru/oru_ogl/extensionator/openglforwarder.h"

#include <iterator>
#include <vector>

using namespace ORU::OGL;
using oru_bench::Compare;
using oru_bench::Comparison;
using oru_bench::EntryPoint;
using oru_bench::Seconds;
using oru_bench::ThreadContext;

namespace {

int const kCalls = 2000;

/// Makes a program with a float uniform current, by plain calls.
/// @return the uniform's location
GLint UseProgramWithUniform() {
    char const *const source = "uniform float value; void main() { gl_Position = vec4(value); }";
    GLuint const shader = EntryPoint<PFNGLCREATESHADERPROC>("glCreateShader")(GL_VERTEX_SHADER);
    EntryPoint<PFNGLSHADERSOURCEPROC>("glShaderSource")(shader, 1, &source, nullptr);
    EntryPoint<PFNGLCOMPILESHADERPROC>("glCompileShader")(shader);
    GLuint const program = EntryPoint<PFNGLCREATEPROGRAMPROC>("glCreateProgram")();
    EntryPoint<PFNGLATTACHSHADERPROC>("glAttachShader")(program, shader);
    EntryPoint<PFNGLLINKPROGRAMPROC>("glLinkProgram")(program);
    EntryPoint<PFNGLUSEPROGRAMPROC>("glUseProgram")(program);
    return EntryPoint<PFNGLGETUNIFORMLOCATIONPROC>("glGetUniformLocation")(program, "value");
}

void CheckedCallOfGL11(benchmark::State &state) {
    ThreadContext const context;
    Compare(
        state, kCalls,
        [] {
            benchmark::DoNotOptimize(::glIsEnabled(GL_BLEND));
            benchmark::DoNotOptimize(::glGetError());
        },
        [] { benchmark::DoNotOptimize(ORU_GL(IsEnabled, GL_BLEND)); });
}
BENCHMARK(CheckedCallOfGL11)->UseManualTime()->Iterations(1000)->ThreadRange(1, 4);

void CheckedCallOfExtension(benchmark::State &state) {
    ThreadContext const context;
    GLint const location = UseProgramWithUniform();
    auto const uniform1f = EntryPoint<PFNGLUNIFORM1FPROC>("glUniform1f");
    Compare(
        state, kCalls,
        [=] {
            uniform1f(location, 0.5f);
            benchmark::DoNotOptimize(::glGetError());
        },
        [=] { ORU_GL(Uniform1f, location, 0.5f); });
}
BENCHMARK(CheckedCallOfExtension)->UseManualTime()->Iterations(1000)->ThreadRange(1, 4);

// The added time is that of one more link. The longer chain goes first in each turn: the other way
// round the processor mispredicts a branch in each call of the shorter chain.
void ForwardingDecorator(benchmark::State &state) {
    ThreadContext const context;
    // Through a pointer, so that both measurements run the same machine code.
    void (*calls)() = [] {
        for (int i = 0; i < kCalls; ++i)
            benchmark::DoNotOptimize(ORU_GL(IsEnabled, GL_BLEND));
    };
    benchmark::DoNotOptimize(calls);
    Comparison comparison(state, kCalls);
    while (state.KeepRunning()) {
        double with = 0;
        {
            InterceptorScope<OpenGLForwarder> const forwarder;
            with = Seconds(calls);
        }
        double const without = Seconds(calls);
        comparison.add(without, with);
    }
}
BENCHMARK(ForwardingDecorator)->UseManualTime()->Iterations(1000);

// The base is the read of the current context that a look-up starts with.
void CurrentTable(benchmark::State &state) {
    ThreadContext const context;
    Compare(
        state, kCalls, [] { benchmark::DoNotOptimize(::wglGetCurrentContext()); },
        [] { benchmark::DoNotOptimize(&ExtensionManager::CurrentTable()); });
}
BENCHMARK(CurrentTable)->UseManualTime()->Iterations(1000)->ThreadRange(1, 4);

char const *const kNames[] = {
#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments) "gl" #Name,
#include "oru/oru_ogl/extensionator/gloperations.inc"
};
std::size_t const kFirstExtended = std::size(kNames) - sizeof(FunctionTable) / sizeof(PROC);

/// Looks every name up, which is the least that reading a device's entry points takes.
void ReadEntryPoints(std::vector<PROC> &addresses) {
    addresses.clear();
    for (std::size_t i = kFirstExtended; i < std::size(kNames); ++i)
        addresses.push_back(::wglGetProcAddress(kNames[i]));
}

/// Does something in a throw-away context, made by plain calls.
template<class Work>
void InPlainContext(Work work) {
    HWND const window = ::CreateWindowA("STATIC", "", WS_OVERLAPPEDWINDOW, 0, 0, 8, 8, nullptr,
                                        nullptr, ::GetModuleHandleW(nullptr), nullptr);
    HDC const dc = ::GetDC(window);
    PIXELFORMATDESCRIPTOR descriptor = {};
    descriptor.nSize = sizeof descriptor;
    ::SetPixelFormat(dc, 1, &descriptor);
    HGLRC const context = ::wglCreateContext(dc);
    ::wglMakeCurrent(dc, context);
    work();
    ::wglMakeCurrent(nullptr, nullptr);
    ::wglDeleteContext(context);
    ::ReleaseDC(window, dc);
    ::DestroyWindow(window);
}

// The record of a context that the host made, against the bare look-ups; both with making the
// context.
void RecordOfContext(benchmark::State &state) {
    oru_bench::OpenLibrary();
    std::vector<PROC> addresses;
    auto const record = [] { benchmark::DoNotOptimize(&ExtensionManager::CurrentTable()); };
    Comparison comparison(state);
    while (state.KeepRunning()) {
        ExtensionManager::Terminate(); // forgets the record; no context is alive
        double const bare = Seconds([&] { InPlainContext([&] { ReadEntryPoints(addresses); }); });
        comparison.add(bare, Seconds([&] { InPlainContext(record); }));
    }
}
BENCHMARK(RecordOfContext)->UseManualTime()->Iterations(100)->Unit(benchmark::kMillisecond);

struct Displays : Context {
    using Context::DisplayOrigin;
};

// The base is the bare loop on a throw-away context, after asking where the device's window
// belongs: that question to the system takes most of the time, `place_ns`.
void RecordOfDevice(benchmark::State &state) {
    oru_bench::OpenLibrary();
    DisplayDeviceKey const key = ContextOffscreen().displayDeviceKey();
    std::vector<PROC> addresses;
    std::vector<double> placing;
    Comparison comparison(state);
    while (state.KeepRunning()) {
        ExtensionManager::Terminate(); // forgets the record; no context is alive
        double const place = Seconds([&] { Displays::DisplayOrigin(key.adapterName, true); });
        double const bare = Seconds([&] { InPlainContext([&] { ReadEntryPoints(addresses); }); });
        placing.push_back(place * 1e9);
        comparison.add(place + bare, Seconds([&] { ExtensionManager::Instance(key); }));
    }
    state.counters["place_ns"] = oru_bench::Median(placing);
}
BENCHMARK(RecordOfDevice)->UseManualTime()->Iterations(40)->Unit(benchmark::kMillisecond);

} // namespace
