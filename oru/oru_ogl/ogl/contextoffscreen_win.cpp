// A context for drawing into OpenGL objects only.
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/internalwindow.h"
#include "oru/oru_ogl/ogl/internal/contexts/adapterorigins_win.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

DisplayDeviceKey const &KeyOf(Context const *share) {
    ORU_ASSERT_TEXT("pContext != NULL", share);
    return share->displayDeviceKey();
}

} // namespace

ContextOffscreen::ContextOffscreen(DisplayDeviceKey const &key) : Context(key) {
    create(nullptr);
}

ContextOffscreen::ContextOffscreen(Context const *share) : Context(KeyOf(share)) {
    create(share);
}

void ContextOffscreen::create(Context const *share) {
    window_ =
        MakeScoped(ORU_NEW InternalWindow(internal::AdapterOrigin(displayDeviceKey().adapterName)));
    initialize(::GetDC(window_->hWnd()), BufferFormat(8, 8, 8, 0, 0, 0, false), BUFFERING_SINGLE,
               MULTISAMPLING_NONE, share);
    publish(share);
}

ContextOffscreen::~ContextOffscreen() {
    DropExceptions([this] { unregisterSharedContext(); });
    DropExceptions([this] { unregisterWithExtensionMgr(); });
    DropExceptions([this] { destroyContext(); });
}

} // namespace ORU::OGL
