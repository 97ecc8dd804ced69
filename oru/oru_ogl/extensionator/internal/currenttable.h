// The function table of the current context, inlined into the operations that call through it.
#pragma once

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/internal/contextregistry.h"
#include "oru/oru_ogl/extensionator/internal/currentcontext.h"

namespace ORU::OGL::internal {

/// What ExtensionManager::CurrentTable returns.
inline FunctionTable const &CurrentTable() {
    HGLRC const rc = ORU_CURRENT_CONTEXT();
    FunctionTable const *const table = ContextRegistry::FindTable(rc);
    return ORU_LIKELY(table) ? *table : ExtensionManager::CurrentTable(rc);
}

} // namespace ORU::OGL::internal
