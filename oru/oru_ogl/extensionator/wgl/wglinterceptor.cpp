// The chain through which the library makes its WGL calls.
#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/sharedptr.h"
#include "oru/oru_ogl/extensionator/internal/currentcontext.h"

namespace ORU::OGL {

WGLInterceptor *WGLInterceptor::sInterceptor_ = nullptr;

namespace internal {

bool gWGLChainIsPlain = false;

HGLRC AskChainForCurrentContext(char const *file, unsigned int line) {
    return WGLInterceptor::Instance()->wcgmGetCurrentContext(file, line);
}

} // namespace internal

WGLInterceptorDecorator::~WGLInterceptorDecorator() = default;

WGLInterceptor *WGLInterceptor::CreateChecker() {
    sInterceptor_ = ORU_NEW WGLErrorChecker();
    internal::gWGLChainIsPlain = true;
    return sInterceptor_;
}

void WGLInterceptor::Destroy() {
    if (!sInterceptor_)
        return;
    auto *const checker = dynamic_cast<WGLErrorChecker *>(sInterceptor_);
    ORU_ENFORCE_TEXT("dynamic_cast<WGLErrorChecker*>(sInterceptor_) != NULL", checker);
    ORUDeleter<WGLErrorChecker>()(checker);
    sInterceptor_ = nullptr;
    internal::gWGLChainIsPlain = false;
}

void WGLInterceptor::addInterceptor(WGLInterceptorDecorator *decorator) {
    decorator->setInterceptor(sInterceptor_);
    sInterceptor_ = decorator;
    internal::gWGLChainIsPlain = false;
}

WGLInterceptorDecorator *WGLInterceptor::popInterceptor() {
    auto *const decorator = dynamic_cast<WGLInterceptorDecorator *>(sInterceptor_);
    if (decorator) {
        sInterceptor_ = decorator->interceptor();
        internal::gWGLChainIsPlain = dynamic_cast<WGLErrorChecker *>(sInterceptor_) != nullptr;
    }
    return decorator;
}

WGLErrorChecker::~WGLErrorChecker() = default;

} // namespace ORU::OGL
