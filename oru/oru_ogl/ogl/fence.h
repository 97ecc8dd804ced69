// Fences: how far the implementation is with the commands that it was given.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/oru_ogl/gltypes.h"
#include "oru/oru_ogl/ogl/ownershiptag.h"

#include <chrono>

namespace ORU::OGL {

/// A mark behind the commands that were given so far: signalled when all of them are done.
///
/// ```cpp
/// texture.subImage(…);                       // a loader thread, in its own context
/// Fence ready = Fence::ForOtherContexts();
///
/// ready.wait();                              // the drawing thread, in a context that shares
/// ```
///
/// Contexts that share objects share fences. A fence moves: what it is moved from, or has given up
/// its handle, is empty. An empty fence can be assigned to and is destroyed without a GL call;
/// whatever else it is asked throws InternalException. OpenGL 3.2 or GL_ARB_sync.
class ORU_API Fence {
public:
    /// Marks the commands that the current context was given so far. It is not sent on: only this
    /// context may wait for it as it is, see `ForOtherContexts`.
    /// @throws InternalException without GL_ARB_sync
    /// @note glFenceSync
    Fence();

    /// A fence that other contexts may wait for: its commands, and the fence with them, are sent on
    /// their way at once. Waiting for one that was never sent does not end.
    /// @throws InternalException without GL_ARB_sync
    /// @note glFenceSync, glFlush
    static Fence ForOtherContexts();

    /// A fence that was made elsewhere. After a failure the handle is the caller's as before.
    /// @throws InternalException without GL_ARB_sync, and for a handle that is no sync object
    /// @note glIsSync
    Fence(GLsync sync, ownership_tag ownership);

    Fence(Fence &&other) noexcept;
    Fence &operator=(Fence &&other) noexcept;

    /// Deletes the sync object that the fence owns; whoever waits for it goes on waiting.
    /// @note glDeleteSync
    ~Fence();

    /// The OpenGL handle; null of an empty fence.
    GLsync sync() const { return sync_; }

    /// Whether the destructor deletes the handle.
    bool ownsName() const { return sync_ && isOwner_; }

    /// Gives up the handle, which is the caller's to delete now; the fence is empty afterwards.
    /// @return the handle
    GLsync disown();

    /// Whether all commands before the fence are done. Never waits.
    /// @note glGetSynciv
    bool isSignalled() const;

    /// Waits, in the calling thread, until the commands before the fence are done. Commands of the
    /// current context are sent on their way first.
    /// @param timeout how long at most; 0 or less asks only
    /// @return whether they are done; false when the time was over first
    /// @throws ExceptionOGL when OpenGL cannot wait
    /// @note glClientWaitSync
    bool clientWait(std::chrono::nanoseconds timeout) const;

    /// Lets the implementation wait: what the current context is given from now on is done after
    /// the commands before the fence. The calling thread goes on at once.
    /// @note glWaitSync
    void wait() const;

    /// Whether the current context has GL_ARB_sync; false without a context.
    static bool IsSupported();

private:
    GLsync checkedSync() const;
    void deleteObject() noexcept;

    GLsync sync_ = nullptr;
    bool isOwner_ = true;
};

} // namespace ORU::OGL
