// Making a context current, or saying that it cannot be.
#include "oru/oru_ogl/ogl/internal/contexts/makecurrent_win.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL::internal {

void MakeCurrent(char const *file, unsigned int line, HDC dc, HGLRC context) {
    if (!WGLInterceptor::Instance()->wcgmMakeCurrent(file, line, dc, context))
        ORU_private::ThrowInternal(
            file, static_cast<int>(line),
            ComposeText("Context::can't make this context current", ::GetLastError()));
}

} // namespace ORU::OGL::internal
