// The chain through which the library makes its WGL calls.
#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/sharedptr.h"

namespace ORU::OGL {

WGLInterceptor *WGLInterceptor::sInterceptor_ = nullptr;

WGLInterceptorDecorator::~WGLInterceptorDecorator() = default;

WGLInterceptor *WGLInterceptor::CreateChecker() {
    return sInterceptor_ = ORU_NEW WGLErrorChecker();
}

void WGLInterceptor::Destroy() {
    if (!sInterceptor_)
        return;
    auto *const checker = dynamic_cast<WGLErrorChecker *>(sInterceptor_);
    ORU_ENFORCE_TEXT("dynamic_cast<WGLErrorChecker*>(sInterceptor_) != NULL", checker);
    ORUDeleter<WGLErrorChecker>()(checker);
    sInterceptor_ = nullptr;
}

void WGLInterceptor::addInterceptor(WGLInterceptorDecorator *decorator) {
    decorator->setInterceptor(sInterceptor_);
    sInterceptor_ = decorator;
}

WGLInterceptorDecorator *WGLInterceptor::popInterceptor() {
    auto *const decorator = dynamic_cast<WGLInterceptorDecorator *>(sInterceptor_);
    if (decorator)
        sInterceptor_ = decorator->interceptor();
    return decorator;
}

WGLErrorChecker::~WGLErrorChecker() = default;

} // namespace ORU::OGL
