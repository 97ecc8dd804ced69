// What a context costs over plain WGL: from the start of a process to the first current context
// with all functions known, and each further context.
#include "bench/comparison.h"
#include "bench/glcontext.h"
#include "bench/plaincontext.h"

#include <cstring>
#include <string>

namespace {

using namespace ORU::OGL;
using oru_bench::PlainContext;

/// The whole work of a process that this program starts of itself.
int RunChild(std::string const &kind) {
    if (kind == "plain") {
        PlainContext context;
        context.makeCurrent();
        return PlainContext::loadAll() > 0 ? 0 : 1;
    }
    AutoInitializer const library;
    ContextOffscreen const context;
    context.makeCurrent();
    return ExtensionManager::CurrentTable().glUseProgram ? 0 : 1;
}

/// Starts this program again and waits for its end.
void StartChild(std::wstring const &kind) {
    wchar_t path[MAX_PATH];
    ::GetModuleFileNameW(nullptr, path, MAX_PATH);
    std::wstring command = L"\"" + std::wstring(path) + L"\" --child " + kind;
    STARTUPINFOW startup = {};
    startup.cb = sizeof startup;
    PROCESS_INFORMATION process = {};
    if (!::CreateProcessW(nullptr, command.data(), nullptr, nullptr, FALSE, 0, nullptr, nullptr,
                          &startup, &process))
        return;
    ::WaitForSingleObject(process.hProcess, INFINITE);
    ::CloseHandle(process.hThread);
    ::CloseHandle(process.hProcess);
}

void ContextFirst(benchmark::State &state) {
    oru_bench::Compare(
        state, 1, [] { StartChild(L"plain"); }, [] { StartChild(L"library"); });
}
BENCHMARK(ContextFirst)->UseManualTime()->Iterations(7)->Unit(benchmark::kMillisecond);

void ContextFurther(benchmark::State &state) {
    oru_bench::ThreadContext const first;
    oru_bench::Compare(
        state, 1,
        [] {
            PlainContext context;
            context.makeCurrent();
            benchmark::DoNotOptimize(PlainContext::loadAll());
        },
        [] {
            ContextOffscreen const context;
            context.makeCurrent();
        });
}
BENCHMARK(ContextFurther)->UseManualTime()->Iterations(25)->Unit(benchmark::kMillisecond);

} // namespace

int main(int count, char **arguments) {
    if (count == 3 && std::strcmp(arguments[1], "--child") == 0)
        return RunChild(arguments[2]);
    benchmark::Initialize(&count, arguments);
    benchmark::RunSpecifiedBenchmarks();
}
