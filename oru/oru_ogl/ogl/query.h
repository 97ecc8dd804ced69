// Queries: what the implementation counted and measured while it drew.
#pragma once

#include "oru/oru_ogl/ogl/object.h"

#include <cstdint>

namespace ORU::OGL {

/// One OpenGL query object: a count of samples or primitives, a time, or a time stamp.
///
/// ```cpp
/// Query samples(Query::TYPE_SAMPLES);
/// {
///     QueryScope const scope(samples);
///     array.drawArrays(GL_TRIANGLES, 0, 36);
/// }
/// // ... a frame later ...
/// if (samples.available())
///     visible = samples.result() > 0;
/// ```
///
/// One query of a type runs at a time, and of TYPE_SAMPLES and TYPE_ANY_SAMPLES one. Contexts that
/// share objects do not share queries: a query is made, used and destroyed in the same context. To
/// time frames see GpuTimer.
class ORU_API Query : public Object {
public:
    /// What a query tells.
    enum Type : unsigned int {
        TYPE_SAMPLES = 0,          ///< samples that passed the depth test; OpenGL 1.5
        TYPE_ANY_SAMPLES,          ///< 1 when any did, else 0; OpenGL 3.3, GL_ARB_occlusion_query2
        TYPE_PRIMITIVES_GENERATED, ///< primitives that the last stage made; OpenGL 3.0
        TYPE_PRIMITIVES_WRITTEN,   ///< primitives that feedback wrote; OpenGL 3.0
        TYPE_TIME_ELAPSED,         ///< nanoseconds; OpenGL 3.3 or GL_ARB_timer_query
        TYPE_TIMESTAMP             ///< the GPU's clock, nanoseconds; the same
    };

    /// Makes a query, which has not measured anything yet.
    /// @throws InternalException for a number that is no Type, and without what the type needs
    /// @note glGenQueries
    explicit Query(Type type);

    /// A query that was made elsewhere. After a failure the name is the caller's as before.
    /// @param type what it was begun with
    /// @throws InternalException also for a name that is no query
    /// @note glIsQuery, glGetQueryiv
    Query(unsigned int name, Type type, ownership_tag ownership);

    Query(Query &&other) noexcept = default;
    Query &operator=(Query &&other) noexcept;

    /// Deletes the query that the object owns; one that runs is ended first.
    /// @note glEndQuery, glDeleteQueries
    ~Query() override;

    /// What the query tells.
    Type type() const;

    /// Starts the measurement; what was measured before is lost. A QueryScope ends it by itself.
    /// @throws InternalException when this query runs already, and for a time stamp; ExceptionOGL
    ///         when another query of the type runs
    /// @note glBeginQuery
    void begin();

    /// Ends the measurement.
    /// @throws InternalException when the query does not run
    /// @note glEndQuery
    void end();

    /// Takes a time stamp, when all commands so far are done.
    /// @throws InternalException for a query of another type
    /// @note glQueryCounter
    void record();

    /// Whether `begin()` was called and `end()` not yet.
    bool isRunning() const {
        requireObject();
        return state_ == RUNNING;
    }

    /// Whether the result is there. Never waits; asked again and again it becomes true.
    /// @throws InternalException for a query that runs or has not measured anything
    /// @note glGetQueryObjectiv
    bool available() const;

    /// What was measured. Waits until it is there.
    /// @return a count, 0 or 1, or nanoseconds; without GL_ARB_timer_query at most 2^32 - 1
    /// @throws InternalException as `available()`
    /// @note glGetQueryObjectui64v with GL_ARB_timer_query, else glGetQueryObjectuiv
    std::uint64_t result() const;

    /// The name of the query of this type that runs, 0 while none does and for time stamps.
    /// @note glGetQueryiv
    unsigned int getBoundID() const;

    /// Whether this is the query of its type that runs. Calls as `getBoundID()`.
    bool isBound() const { return getBoundID() == objectID(); }

    /// @name Translations to and from GL targets
    /// @throws InternalException for a value outside the enumeration
    /// @{
    static unsigned int Type2GL(Type type);
    static Type GL2Type(unsigned int target);
    /// @}

    /// Whether the current context has queries of a type; false without a context.
    static bool IsSupported(Type type);

private:
    enum State : unsigned char { NOTHING_MEASURED, RUNNING, MEASURED };

    void deleteObject() noexcept;
    void requireResult() const;

    /// After a begin or end that failed: an error that was pending before ends them, too, when they
    /// are done. @note glGetQueryiv
    void askWhetherRunning(State otherwise) noexcept;

    State state_ = NOTHING_MEASURED;
    bool isWide_; ///< whether results have 64 bits
};

} // namespace ORU::OGL
