// Uses the installed library as a host does: the versions of package, headers and DLL, a start-up
// and failures caught by their types, after which the run-time library knows of no exception that
// is still on its way.
#include <oru/oru_ogl/extensionator/glcall.h>
#include <oru/oru_ogl/libraryogl.h>
#include <oru/oru_ogl/ogl/contextoffscreen_win.h>
#include <oru/version.h>

#include <exception>
#include <string>

int main() {
    if (std::string(ORU_VERSION_STRING) != PACKAGE_VERSION ||
        ORU::Version() != std::string(PACKAGE_VERSION))
        return 1;
    ORU::OGL::AutoInitializer const layer;
    int caught = 0;
    try {
        ORU_GL(BindTexture, 0x1234, 1u); // without a context
    } catch (ORU::LogicalException const &) {
        ++caught;
    }
    ORU::OGL::ContextOffscreen context;
    context.makeCurrent();
    try {
        ORU_GL(BindTexture, 0x1234, 1u); // to no target
    } catch (ORU::OGL::ExceptionOGL const &e) {
        caught += e.errorNumber() == 0x0500;
    }
    return caught == 2 && std::uncaught_exceptions() == 0 ? 0 : 1;
}
