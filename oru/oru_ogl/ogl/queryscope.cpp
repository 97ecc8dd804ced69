// A query that runs for a scope.
#include "oru/oru_ogl/ogl/queryscope.h"

#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/query.h"

namespace ORU::OGL {

namespace {

void End(Query &query) noexcept {
    internal::Release([&query] {
        if (query.isRunning())
            query.end();
    });
}

} // namespace

QueryScope::QueryScope(Query &query) : query_(query) {
    try {
        query_.begin();
    } catch (ExceptionOGL const &) {
        End(query_); // an error that was pending before ends the call when the query runs
        throw;
    }
}

QueryScope::~QueryScope() {
    End(query_);
}

} // namespace ORU::OGL
