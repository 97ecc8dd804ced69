// A query that runs for a scope.
#include "oru/oru_ogl/ogl/queryscope.h"

#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/query.h"

namespace ORU::OGL {

QueryScope::QueryScope(Query &query) : query_(query) {
    query_.begin();
}

QueryScope::~QueryScope() {
    internal::Release([this] {
        if (query_.isRunning())
            query_.end();
    });
}

} // namespace ORU::OGL
