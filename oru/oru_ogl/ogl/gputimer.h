// How long the GPU takes for each frame.
#pragma once

#include "oru/core/utility/export.h"

#include <chrono>
#include <cstdint>
#include <optional>
#include <vector>

namespace ORU::OGL {

/// Times on the GPU's clock, told some frames later, so that nothing ever waits.
///
/// ```cpp
/// GpuTimer timer;
/// while (running) {
///     timer.begin();
///     drawFrame();
///     timer.end();
///     while (auto const time = timer.take())
///         slowest = std::max(slowest, *time);
/// }
/// ```
///
/// It has a ring of time stamps, two for each frame on its way, and allocates and makes nothing
/// after its constructor. Timers overlap and nest as you like, also with queries of
/// Query::TYPE_TIME_ELAPSED. Made, used and destroyed in the same context; a timer moves, and what
/// it is moved from can be assigned to and destroyed only. OpenGL 3.3 or GL_ARB_timer_query.
class ORU_API GpuTimer {
public:
    /// Makes the ring.
    /// @param frames how many measurements may be on their way, at least 1; more than frames that
    ///        the implementation runs behind
    /// @throws InternalException without GL_ARB_timer_query, when the driver's clock has no bits,
    ///         and for no frames
    /// @note glGenQueries, glGetQueryiv
    explicit GpuTimer(unsigned int frames = 4);

    GpuTimer(GpuTimer &&other) noexcept;
    GpuTimer &operator=(GpuTimer &&other) noexcept;

    /// Deletes the ring. @note glDeleteQueries
    ~GpuTimer();

    /// Starts a measurement. When the ring is full, its oldest measurement gives way; when even
    /// that is not there yet, the frame goes unmeasured rather than wait. `missed()` counts both.
    /// @throws InternalException when the timer runs already
    /// @note glQueryCounter, in a full ring glGetQueryObjectiv
    void begin();

    /// Ends a measurement.
    /// @throws InternalException when the timer does not run
    /// @note glQueryCounter
    void end();

    /// The oldest measurement that was not taken yet. Never waits.
    /// @return none when there is none, or when it is not there yet
    /// @note glGetQueryObjectiv, glGetQueryObjectui64v
    std::optional<std::chrono::nanoseconds> take();

    /// How many measurements have ended and were not taken yet.
    unsigned int pending() const { return pending_; }

    /// How many frames will have no result: see `begin()`.
    std::uint64_t missed() const { return missed_; }

    /// Whether the current context has GL_ARB_timer_query; false without a context.
    static bool IsSupported();

private:
    enum State : unsigned char { IDLE, RUNNING, UNMEASURED };

    unsigned int frames() const { return static_cast<unsigned int>(names_.size() / 2); }
    unsigned int *stamps(unsigned int frame) {
        return &names_[std::size_t{2} * (frame % frames())];
    }
    void requireRing() const;
    bool isOldestThere();
    void dropOldest();
    void deleteObjects() noexcept;

    std::vector<unsigned int> names_; ///< GL queries, two for each frame
    unsigned int oldest_ = 0;         ///< frame in the ring
    unsigned int pending_ = 0;
    std::uint64_t missed_ = 0;
    std::uint64_t clockMask_ = 0; ///< the bits that the GPU's clock has
    State state_ = IDLE;
};

} // namespace ORU::OGL
