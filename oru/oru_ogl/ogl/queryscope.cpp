// A query that runs for a scope.
#include "oru/oru_ogl/ogl/queryscope.h"

#include "oru/oru_ogl/ogl/internal/objects/pendingerror.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/query.h"

namespace ORU::OGL {

namespace {

void End(Query &query) {
    if (query.isRunning())
        query.end();
}

} // namespace

QueryScope::QueryScope(Query &query) : query_(query) {
    internal::ReportPendingError(__FILE__, __LINE__, "glBeginQuery");
    query_.begin();
}

QueryScope::~QueryScope() {
    internal::Release([this] { End(query_); });
}

} // namespace ORU::OGL
