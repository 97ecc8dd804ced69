// What capability records need of contexts.
#include "oru/oru_ogl/extensionator/internal/contextservices.h"

#include "oru/oru_ogl/ogl/internal/contextbootstrap_win.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

namespace ORU::OGL::internal {

DisplayDeviceKey const &DisplayDeviceOf(Context const &context) {
    return context.displayDeviceKey();
}

HGLRC RenderContextOf(Context const &context) {
    return context.renderContext();
}

void MakeContextCurrent(Context const &context) {
    context.makeCurrent();
}

void WithBootstrapContext(DisplayDeviceKey const &key, std::function<void(Context *)> const &use) {
    ScopedContextWrapper const restoreCurrent;
    ContextBootstrap bootstrap(key);
    bootstrap.makeCurrent();
    use(&bootstrap);
}

} // namespace ORU::OGL::internal
