// Fences: how far the implementation is with the commands that it was given.
#include "oru/oru_ogl/ogl/fence.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <utility>

namespace ORU::OGL {

Fence::Fence() {
    ORU_ASSERT_SUPPORTED(GL_ARB_SYNC);
    sync_ = ORU_GL(FenceSync, GL_SYNC_GPU_COMMANDS_COMPLETE, 0);
    ORU_ASSERT_TEXT("OpenGL made no fence: there is no memory for it, or the context is lost",
                    sync_);
}

Fence Fence::ForOtherContexts() {
    Fence fence;
    ORU_GL0(Flush);
    return fence;
}

Fence::Fence(GLsync sync, ownership_tag ownership) : isOwner_(ownership.isOwner) {
    ORU_ASSERT_SUPPORTED(GL_ARB_SYNC);
    if (!ORU_GL(IsSync, sync))
        ORU_THROW_INTERNAL("The handle is no sync object of the current context");
    sync_ = sync;
}

Fence::Fence(Fence &&other) noexcept
    : sync_(std::exchange(other.sync_, nullptr)), isOwner_(other.isOwner_) {}

Fence &Fence::operator=(Fence &&other) noexcept {
    if (this == &other)
        return *this;
    deleteObject();
    sync_ = std::exchange(other.sync_, nullptr);
    isOwner_ = other.isOwner_;
    return *this;
}

Fence::~Fence() {
    deleteObject();
}

void Fence::deleteObject() noexcept {
    if (ownsName())
        internal::Release([this] { ORU_GL(DeleteSync, sync_); });
}

GLsync Fence::checkedSync() const {
    if (!sync_)
        ORU_THROW_INTERNAL("This fence is empty: it was moved from, or has given up its handle. "
                           "Use the one it was moved to, or assign a new one to it");
    return sync_;
}

GLsync Fence::disown() {
    checkedSync();
    return std::exchange(sync_, nullptr);
}

bool Fence::isSignalled() const {
    GLint status = GL_UNSIGNALED;
    ORU_GL(GetSynciv, checkedSync(), GL_SYNC_STATUS, 1, nullptr, &status);
    return status == GL_SIGNALED;
}

bool Fence::clientWait(std::chrono::nanoseconds timeout) const {
    auto const limit = static_cast<GLuint64>(std::max(timeout.count(), decltype(timeout)::rep(0)));
    GLenum const outcome = ORU_GL(ClientWaitSync, checkedSync(), GL_SYNC_FLUSH_COMMANDS_BIT, limit);
    return outcome == GL_ALREADY_SIGNALED || outcome == GL_CONDITION_SATISFIED;
}

void Fence::wait() const {
    ORU_GL(WaitSync, checkedSync(), 0, GL_TIMEOUT_IGNORED);
}

bool Fence::IsSupported() {
    return internal::Supports(GL_ARB_SYNC);
}

} // namespace ORU::OGL
