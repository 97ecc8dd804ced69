// What capability records need of the layers above them, which define it.
#pragma once

#include "oru/core/utility/windowsforward.h"

#include <functional>

namespace ORU::OGL {

class Context;
struct DisplayDeviceKey;

namespace internal {

/// Whether the host has opened the library; defined beside Library.
bool IsLibraryInitialized();

/// @name A context as its record sees it
/// @{
DisplayDeviceKey const &DisplayDeviceOf(Context const &context);
HGLRC RenderContextOf(Context const &context);
void MakeContextCurrent(Context const &context);
/// @}

/// Makes a throw-away context of a display device, makes it current and calls `use` with it; the
/// thread's current context is the same afterwards.
/// @throws InternalException when there is no such adapter, and whatever `use` throws
void WithBootstrapContext(DisplayDeviceKey const &key, std::function<void(Context *)> const &use);

/// @name The test by drawing
/// Whether the current implementation filters textures of 32-bit or 16-bit floats linearly. Drawn
/// in a context of its own, so that nothing of the current one changes.
/// @throws LogicalException when the drawing fails
/// @{
bool FiltersFloatsLinearly();
bool FiltersHalvesLinearly();
/// @}

} // namespace internal
} // namespace ORU::OGL
