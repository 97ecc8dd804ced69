// Which capability record belongs to which rendering context.
#pragma once

#include "oru/core/utility/windowsforward.h"

namespace ORU {
namespace OGL {

class ExtensionManager;

namespace internal {

/// The process-wide map from rendering contexts to the records of their implementation, which it
/// does not own. Any thread may look up, insert and erase at any time.
///
/// A look-up stands before every OpenGL call beyond 1.1, so it must not write anything that threads
/// share, which the concurrent map's element locks do. A small read-only index answers for the
/// contexts in use; only what it does not hold goes to the map.
namespace ContextRegistry {

/// The context's record, or null.
ExtensionManager *Find(HGLRC context);

/// Adds an entry; one already present for the context stays.
void Insert(HGLRC context, ExtensionManager *record);

/// Removes an entry.
/// @return whether there was one
bool Erase(HGLRC context);

void Clear();

} // namespace ContextRegistry
} // namespace internal
} // namespace OGL
} // namespace ORU
