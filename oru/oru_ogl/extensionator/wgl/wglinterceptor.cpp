// The chain through which the library makes its WGL calls.
#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/sharedptr.h"
#include "oru/oru_ogl/extensionator/internal/currentcontext.h"

namespace ORU::OGL {

namespace internal {

std::atomic<bool> gIsWGLChainPlain{false};

HGLRC AskChainForCurrentContext(char const *file, unsigned int line) {
    return WGLInterceptor::Instance()->wcgmGetCurrentContext(file, line);
}

} // namespace internal

namespace {

void NoteFirst(WGLInterceptor const *link) {
    internal::gIsWGLChainPlain.store(dynamic_cast<WGLErrorChecker const *>(link) != nullptr,
                                     std::memory_order_relaxed);
}

} // namespace

WGLInterceptor *WGLInterceptor::sInterceptor_ = nullptr;

WGLInterceptorDecorator::~WGLInterceptorDecorator() = default;

WGLInterceptor *WGLInterceptor::CreateChecker() {
    sInterceptor_ = ORU_NEW WGLErrorChecker();
    NoteFirst(sInterceptor_);
    return sInterceptor_;
}

void WGLInterceptor::Destroy() {
    if (!sInterceptor_)
        return;
    auto *const checker = dynamic_cast<WGLErrorChecker *>(sInterceptor_);
    ORU_ENFORCE_TEXT("dynamic_cast<WGLErrorChecker*>(sInterceptor_) != NULL", checker);
    ORUDeleter<WGLErrorChecker>()(checker);
    sInterceptor_ = nullptr;
    NoteFirst(nullptr);
}

void WGLInterceptor::addInterceptor(WGLInterceptorDecorator *decorator) {
    decorator->setInterceptor(sInterceptor_);
    sInterceptor_ = decorator;
    NoteFirst(decorator);
}

WGLInterceptorDecorator *WGLInterceptor::popInterceptor() {
    auto *const decorator = dynamic_cast<WGLInterceptorDecorator *>(sInterceptor_);
    if (decorator) {
        sInterceptor_ = decorator->interceptor();
        NoteFirst(sInterceptor_);
    }
    return decorator;
}

WGLErrorChecker::~WGLErrorChecker() = default;

} // namespace ORU::OGL
