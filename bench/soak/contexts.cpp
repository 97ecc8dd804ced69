// Many contexts in one process.
#include "bench/plaincontext.h"
#include "bench/soak/footprint.h"
#include "bench/soak/soaks.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/bufferformat.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"

#include <cstdio>

namespace Soak {

namespace {

using namespace ORU::OGL;

constexpr double kMostBytes = 4096; ///< that a context may add beyond a plain one

/// What a way to make contexts leaves behind.
struct Trace {
    Growth growth;
    Handles before, after;
};

/// Makes and destroys contexts. Handles are compared once the process is warm.
template<class Make>
Trace Follow(std::size_t count, Make const &make) {
    Trace trace;
    for (std::size_t i = 0; i < Growth::StepsFor(count); ++i) {
        make();
        trace.growth.measure();
        if (trace.growth.isWarm(count))
            trace.before = Handles::Now();
    }
    trace.after = Handles::Now();
    return trace;
}

void MakePlain() {
    oru_bench::PlainContext context;
    context.makeCurrent();
    oru_bench::PlainContext::loadAll();
}

void MakeOnWindow() {
    HWND const window = ::CreateWindowW(L"STATIC", nullptr, WS_POPUP, 0, 0, 8, 8, nullptr, nullptr,
                                        ::GetModuleHandleW(nullptr), nullptr);
    {
        ContextWindowed const context(window, BufferFormat::FORMAT_RGBA8_D24,
                                      Context::BUFFERING_DOUBLE, Context::MULTISAMPLING_NONE,
                                      nullptr);
        context.makeCurrent();
    }
    ::DestroyWindow(window);
}

void MakeOffscreen() {
    ContextOffscreen const context;
    context.makeCurrent();
}

} // namespace

Verdict MakeContexts(std::size_t count) {
    Trace const plain = Follow(count, MakePlain);
    AutoInitializer const library;
    Trace const own = Follow(count, MakeOffscreen);
    Trace const windowed = Follow(count / 8, MakeOnWindow);

    double const excess = own.growth.bytesPerStep() - plain.growth.bytesPerStep();
    char text[200];
    std::snprintf(text, sizeof text,
                  "%zu contexts: %+.0f bytes a context, by plain calls %+.0f (apart %s); ", count,
                  own.growth.bytesPerStep(), plain.growth.bytesPerStep(),
                  own.growth.limit(kMostBytes).c_str());
    char more[80];
    std::snprintf(more, sizeof more, "; %zu on windows: %+.0f bytes a context, ", count / 8,
                  windowed.growth.bytesPerStep());
    bool const isFlat = !own.growth.isLongEnough() || excess <= kMostBytes;
    return {isFlat && own.after.isWithin(own.before) && windowed.after.isWithin(windowed.before),
            text + Change(own.before, own.after) + "; by plain calls " +
                Change(plain.before, plain.after) + more + Change(windowed.before, windowed.after)};
}

} // namespace Soak
