// The chain through which the library makes its OpenGL calls.
#include "oru/oru_ogl/extensionator/openglinterceptor.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/sharedptr.h"
#include "oru/oru_ogl/extensionator/openglerrorchecker.h"
#include "oru/oru_ogl/extensionator/openglinterceptordecorator.h"

namespace ORU::OGL {

OpenGLInterceptor *OpenGLInterceptor::sInterceptor_ = nullptr;

OpenGLInterceptor::~OpenGLInterceptor() = default;

OpenGLInterceptorDecorator::~OpenGLInterceptorDecorator() = default;

OpenGLInterceptor *OpenGLInterceptor::CreateErrorChecker() {
    return sInterceptor_ = ORU_NEW OpenGLErrorChecker();
}

void OpenGLInterceptor::Destroy() {
    if (!sInterceptor_)
        return;
    ORU_ENFORCE_TEXT("dynamic_cast<OpenGLErrorChecker *>(sInterceptor_) != NULL",
                     dynamic_cast<OpenGLErrorChecker *>(sInterceptor_));
    ORUDeleter<OpenGLInterceptor>()(sInterceptor_);
    sInterceptor_ = nullptr;
}

void OpenGLInterceptor::addInterceptor(OpenGLInterceptorDecorator *decorator) {
    decorator->setInterceptor(sInterceptor_);
    sInterceptor_ = decorator;
}

OpenGLInterceptorDecorator *OpenGLInterceptor::popInterceptor() {
    auto *const decorator = dynamic_cast<OpenGLInterceptorDecorator *>(sInterceptor_);
    if (decorator)
        sInterceptor_ = decorator->interceptor();
    return decorator;
}

} // namespace ORU::OGL
