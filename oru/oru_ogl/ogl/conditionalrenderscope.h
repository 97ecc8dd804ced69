// Drawing that depends on a query, for a scope.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

class Query;

/// Lets the implementation skip what is drawn until the block ends, when a query found no sample.
/// The host need not wait for the result.
///
/// ```cpp
/// {
///     ConditionalRenderScope const scope(boxIsVisible, ConditionalRenderScope::MODE_NO_WAIT);
///     model.drawElements(GL_TRIANGLES, 30000);
/// }
/// ```
///
/// OpenGL 3.0.
class ORU_API ConditionalRenderScope {
public:
    /// What happens while the result is not there yet.
    enum Mode : unsigned int {
        MODE_WAIT = 0,          ///< GL_QUERY_WAIT: the implementation waits for it
        MODE_NO_WAIT,           ///< GL_QUERY_NO_WAIT: it may draw all the same
        MODE_BY_REGION_WAIT,    ///< GL_QUERY_BY_REGION_WAIT: waits; may skip parts of the picture
        MODE_BY_REGION_NO_WAIT, ///< GL_QUERY_BY_REGION_NO_WAIT
    };

    /// Makes drawing depend on the query.
    /// @param query of TYPE_SAMPLES or TYPE_ANY_SAMPLES, ended; outlives the scope
    /// @throws InternalException for another query and a number that is no Mode, and without OpenGL
    ///         3.0; ExceptionOGL for a scope in another one, and a query that has measured nothing
    /// @note glBeginConditionalRender
    ConditionalRenderScope(Query const &query, Mode mode);

    /// Draws everything again; a failure is dropped.
    /// @note glEndConditionalRender
    ~ConditionalRenderScope();

    ConditionalRenderScope(ConditionalRenderScope const &) = delete;
    ConditionalRenderScope &operator=(ConditionalRenderScope const &) = delete;

    /// @name Translations to and from GL modes
    /// @throws InternalException for a value outside the enumeration
    /// @{
    static unsigned int Mode2GL(Mode mode);
    static Mode GL2Mode(unsigned int mode);
    /// @}

    /// Whether the current context can do so: OpenGL 3.0; false without a context.
    static bool IsSupported();
};

} // namespace ORU::OGL
