// What the OpenGL benchmarks share: the open library and a context for each thread.
#pragma once

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/platformgl.h"

#include <benchmark/benchmark.h>

#include <memory>
#include <mutex>

namespace oru_bench {

/// Opens the library for the rest of the program.
inline void OpenLibrary() {
    static bool const kIsOpen = [] {
        ORU::OGL::Library::Initialize(ORU::OGL::Library::InitOptions());
        return true;
    }();
    static_cast<void>(kIsOpen);
}

/// A context of the library, current on the calling thread. The library's share groups are not
/// locked, so threads make and end theirs one after the other.
class ThreadContext {
public:
    ThreadContext() {
        std::lock_guard<std::mutex> const lock(Mutex());
        OpenLibrary();
        context_ = std::make_unique<ORU::OGL::ContextOffscreen>();
        context_->makeCurrent();
    }
    ~ThreadContext() {
        std::lock_guard<std::mutex> const lock(Mutex());
        context_.reset();
    }
    ThreadContext(ThreadContext const &) = delete;
    ThreadContext &operator=(ThreadContext const &) = delete;

    ORU::OGL::ContextOffscreen &operator*() { return *context_; }

private:
    static std::mutex &Mutex() {
        static std::mutex mutex;
        return mutex;
    }

    std::unique_ptr<ORU::OGL::ContextOffscreen> context_;
};

/// An entry point by its name, in its own type.
template<class Function>
Function EntryPoint(char const *name) {
    return reinterpret_cast<Function>(reinterpret_cast<void *>(::wglGetProcAddress(name)));
}

} // namespace oru_bench

/// A plain call with its error query, which the library makes too.
#define ORU_PLAIN(call) ((call), benchmark::DoNotOptimize(::glGetError()))
