// A query that runs for a scope.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

class Query;

/// Begins a query, and ends it when the block ends, however it ends.
class ORU_API QueryScope {
public:
    /// Begins the query.
    /// @param query no time stamp; outlives the scope and stays where it is
    /// @throws InternalException and ExceptionOGL as Query::begin
    /// @note glBeginQuery
    explicit QueryScope(Query &query);

    /// Ends the query, unless it has ended; a failure is dropped.
    /// @note glEndQuery
    ~QueryScope();

    QueryScope(QueryScope const &) = delete;
    QueryScope &operator=(QueryScope const &) = delete;

private:
    Query &query_;
};

} // namespace ORU::OGL
