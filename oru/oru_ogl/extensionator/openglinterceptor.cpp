// The chain through which the library makes its OpenGL calls.
#include "oru/oru_ogl/extensionator/openglinterceptor.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/sharedptr.h"
#include "oru/oru_ogl/extensionator/internal/openglerrorcheck.h"
#include "oru/oru_ogl/extensionator/openglinterceptordecorator.h"

namespace ORU::OGL {

namespace {

void NoteFirst(OpenGLInterceptor const *link) {
    auto const *const checker = dynamic_cast<OpenGLErrorChecker const *>(link);
    internal::gIsOpenGLChainPlain.store(checker && !checker->isInsideBeginEnd(),
                                        std::memory_order_relaxed);
}

} // namespace

std::atomic<bool> internal::gIsOpenGLChainPlain{false};
OpenGLInterceptor *OpenGLInterceptor::sInterceptor_ = nullptr;

OpenGLInterceptor::~OpenGLInterceptor() = default;

OpenGLInterceptorDecorator::~OpenGLInterceptorDecorator() = default;

OpenGLInterceptor *OpenGLInterceptor::CreateErrorChecker() {
    sInterceptor_ = ORU_NEW OpenGLErrorChecker();
    NoteFirst(sInterceptor_);
    return sInterceptor_;
}

void OpenGLInterceptor::Destroy() {
    if (!sInterceptor_)
        return;
    ORU_ENFORCE_TEXT("dynamic_cast<OpenGLErrorChecker *>(sInterceptor_) != NULL",
                     dynamic_cast<OpenGLErrorChecker *>(sInterceptor_));
    ORUDeleter<OpenGLInterceptor>()(sInterceptor_);
    sInterceptor_ = nullptr;
    NoteFirst(nullptr);
}

void OpenGLInterceptor::addInterceptor(OpenGLInterceptorDecorator *decorator) {
    decorator->setInterceptor(sInterceptor_);
    sInterceptor_ = decorator;
    NoteFirst(decorator);
}

OpenGLInterceptorDecorator *OpenGLInterceptor::popInterceptor() {
    auto *const decorator = dynamic_cast<OpenGLInterceptorDecorator *>(sInterceptor_);
    if (decorator) {
        sInterceptor_ = decorator->interceptor();
        NoteFirst(sInterceptor_);
    }
    return decorator;
}

} // namespace ORU::OGL
