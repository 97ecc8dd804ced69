// How long the GPU takes for each frame.
#include "oru/oru_ogl/ogl/gputimer.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/platformgl.h"

#include <utility>

namespace ORU::OGL {

GpuTimer::GpuTimer(unsigned int frames) : names_(2 * std::size_t{frames}) {
    ORU_ASSERT_SUPPORTED(GL_ARB_TIMER_QUERY);
    if (frames == 0)
        ORU_THROW_INTERNAL("A GpuTimer needs room for at least one frame");
    GLint bits = 0;
    ORU_GL(GetQueryiv, GL_TIMESTAMP, GL_QUERY_COUNTER_BITS, &bits);
    if (bits <= 0)
        ORU_THROW_INTERNAL("The driver has no clock that a GpuTimer could read");
    clockMask_ = ~std::uint64_t{0} >> (bits < 64 ? 64 - bits : 0);
    try {
        // An error that the host left pending ends the call, too, after the names were made.
        ORU_GL(GenQueries, static_cast<GLsizei>(names_.size()), names_.data());
    } catch (...) {
        deleteObjects();
        throw;
    }
}

GpuTimer::GpuTimer(GpuTimer &&other) noexcept
    : names_(std::exchange(other.names_, {})), oldest_(other.oldest_),
      pending_(std::exchange(other.pending_, 0)), missed_(std::exchange(other.missed_, 0)),
      clockMask_(other.clockMask_), state_(std::exchange(other.state_, IDLE)) {}

GpuTimer &GpuTimer::operator=(GpuTimer &&other) noexcept {
    if (this == &other)
        return *this;
    deleteObjects();
    names_ = std::exchange(other.names_, {});
    oldest_ = other.oldest_;
    pending_ = std::exchange(other.pending_, 0);
    missed_ = std::exchange(other.missed_, 0);
    clockMask_ = other.clockMask_;
    state_ = std::exchange(other.state_, IDLE);
    return *this;
}

GpuTimer::~GpuTimer() {
    deleteObjects();
}

void GpuTimer::deleteObjects() noexcept {
    if (!names_.empty())
        internal::Release(
            [this] { ORU_GL(DeleteQueries, static_cast<GLsizei>(names_.size()), names_.data()); });
}

void GpuTimer::requireRing() const {
    if (names_.empty())
        ORU_THROW_INTERNAL("This timer is empty: it was moved from. Use the one it was moved to, "
                           "or assign a new one to it");
}

void GpuTimer::begin() {
    requireRing();
    if (state_ != IDLE)
        ORU_THROW_INTERNAL("GpuTimer::begin: the timer runs already. Call end() first");
    if (pending_ == frames()) {
        bool const isThere = isOldestThere();
        ++missed_;
        if (!isThere) {
            state_ = UNMEASURED;
            return;
        }
        dropOldest();
    }
    ORU_GL(QueryCounter, stamps(oldest_ + pending_)[0], GL_TIMESTAMP);
    state_ = RUNNING;
}

void GpuTimer::end() {
    requireRing();
    if (state_ == IDLE)
        ORU_THROW_INTERNAL("GpuTimer::end: the timer does not run. Call begin() first");
    if (std::exchange(state_, IDLE) == UNMEASURED)
        return;
    ++missed_; // unless the second stamp is taken
    ORU_GL(QueryCounter, stamps(oldest_ + pending_)[1], GL_TIMESTAMP);
    --missed_;
    ++pending_;
}

bool GpuTimer::isOldestThere() {
    GLint isThere = GL_FALSE;
    ORU_GL(GetQueryObjectiv, stamps(oldest_)[1], GL_QUERY_RESULT_AVAILABLE, &isThere);
    return isThere != GL_FALSE;
}

void GpuTimer::dropOldest() {
    oldest_ = (oldest_ + 1) % frames();
    --pending_;
}

std::optional<std::chrono::nanoseconds> GpuTimer::take() {
    requireRing();
    if (pending_ == 0 || !isOldestThere())
        return std::nullopt;
    GLuint64 begin = 0, end = 0;
    ORU_GL(GetQueryObjectui64v, stamps(oldest_)[0], GL_QUERY_RESULT, &begin);
    ORU_GL(GetQueryObjectui64v, stamps(oldest_)[1], GL_QUERY_RESULT, &end);
    dropOldest();
    // The clock may have begun anew between the two.
    return std::chrono::nanoseconds(static_cast<std::int64_t>((end - begin) & clockMask_));
}

bool GpuTimer::IsSupported() {
    return internal::Supports(GL_ARB_TIMER_QUERY);
}

} // namespace ORU::OGL
