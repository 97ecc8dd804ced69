// Questions to the capability record of the current context.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

namespace ORU::OGL::internal {

/// Whether there is a current context and a test of its record holds:
/// `CurrentRecord(&ExtensionManager::supportsTexture3D)`.
template<class... Parameters>
bool CurrentRecord(bool (ExtensionManager::*test)(Parameters...) const, Parameters... arguments) {
    ExtensionManager const *const record = ExtensionManager::Instance();
    return record && (record->*test)(arguments...);
}

/// Whether there is a current context and it has a capability.
inline bool Supports(OpenGLExtension e) {
    return CurrentRecord(&ExtensionManager::isSupported, e);
}

} // namespace ORU::OGL::internal

/// Throws InternalException unless the current context has a capability.
#define ORU_ASSERT_SUPPORTED(e)                                                                    \
    (::ORU::OGL::internal::Supports(e)                                                             \
         ? void(0)                                                                                 \
         : ::ORU_private::ThrowInternal(__FILE__, __LINE__,                                        \
                                        "ExtensionManager::Instance()->isSupported(" #e ")"))
