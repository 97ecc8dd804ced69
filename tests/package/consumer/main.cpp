// Uses the installed library as a host does: a start-up and a failure caught by its type, after
// which the host's own exceptions and streams work as before.
#include <oru/core/exceptions/internalexception.h>
#include <oru/oru_ogl/extensionator/glcall.h>
#include <oru/oru_ogl/libraryogl.h>
#include <oru/oru_ogl/ogl/contextoffscreen_win.h>

#include <cstdio>
#include <exception>
#include <ostream>
#include <streambuf>

namespace {

/// Counts the flushes of a stream.
class Flushes : public std::streambuf {
public:
    int count = 0;

protected:
    int overflow(int c) override { return c; }
    int sync() override { return ++count, 0; }
};

int Expect(bool holds, char const *what) {
    if (!holds)
        std::printf("not so: %s\n", what);
    return holds ? 0 : 1;
}

} // namespace

int main() {
    ORU::OGL::AutoInitializer const layer;
    int failures = 0;
    for (int i = 0; i < 2; ++i) {
        try {
            ORU_GL(BindTexture, 0x1234, 1u);
            failures += Expect(false, "a call without a context fails");
        } catch (ORU::LogicalException const &) {
        }
    }
    failures += Expect(std::uncaught_exceptions() == 0, "no exception is on its way");
    Flushes flushes;
    std::ostream log(&flushes);
    log << std::unitbuf << "a line";
    failures += Expect(flushes.count > 0, "a stream with unitbuf flushes");

    ORU::OGL::ContextOffscreen context;
    context.makeCurrent();
    try {
        ORU_GL(BindTexture, 0x1234, 1u);
    } catch (ORU::OGL::ExceptionOGL const &e) {
        return failures + Expect(e.errorNumber() == 0x0500, "the error has its number");
    }
    return failures + Expect(false, "a wrong target fails");
}
