// A context that draws into a window of the host.
#include "oru/oru_ogl/ogl/contextwindowed_win.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/wgl/extensionswgl.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

ContextWindowed::ContextWindowed(HWND window, BufferFormat const &format, Buffering buffering,
                                 Multisampling multisampling, Context const *share)
    : Context(DisplayDeviceFromWindow(window)), window_(window) {
    initialize(::GetDC(window), format, buffering, multisampling, share);
    publish(share);
}

ContextWindowed::~ContextWindowed() {
    DropExceptions([this] { unregisterSharedContext(); });
    DropExceptions([this] { unregisterWithExtensionMgr(); });
    DropExceptions([this] { destroyContext(); });
}

void ContextWindowed::enableSyncToVerticalRetrace(bool enable) {
    if (!SupportsVerticalRetraceControl())
        ORU_THROW_INTERNAL("ContextWindowed::enableSyncToVerticalRetrace unsupported feature");
    _wcgmSwapIntervalEXT(enable ? 1 : 0);
}

} // namespace ORU::OGL
