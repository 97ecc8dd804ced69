// Questions to the capability record of the current context.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/internal/contextregistry.h"
#include "oru/oru_ogl/extensionator/internal/currentcontext.h"

namespace ORU::OGL::internal {

/// The record of the current context, null without one. A core context that the host made may have
/// none yet, and the defaults for unknown contexts are not for it: its record is made.
inline ExtensionManager const *RecordOfCurrent() {
    HGLRC const context = ORU_CURRENT_CONTEXT();
    if (ExtensionManager const *record = ContextRegistry::FindAtOnce(context))
        return record;
    ExtensionManager const *const record = ExtensionManager::Instance(context);
    if (record || !IsCoreContext())
        return record;
    return ExtensionManager::InstanceGuaranteed(context);
}

/// Whether there is a current context and a test of its record holds:
/// `CurrentRecord(&ExtensionManager::supportsTexture3D)`.
template<class... Parameters>
bool CurrentRecord(bool (ExtensionManager::*test)(Parameters...) const, Parameters... arguments) {
    ExtensionManager const *const record = RecordOfCurrent();
    return record && (record->*test)(arguments...);
}

/// Whether there is a current context and it has a capability.
inline bool Supports(OpenGLExtension e) {
    ExtensionManager const *const record = RecordOfCurrent();
    return record && record->isSupported(e);
}

} // namespace ORU::OGL::internal

/// Throws InternalException unless the current context has a capability.
#define ORU_ASSERT_SUPPORTED(e)                                                                    \
    (::ORU::OGL::internal::Supports(e)                                                             \
         ? void(0)                                                                                 \
         : ::ORU_private::ThrowInternal(__FILE__, __LINE__,                                        \
                                        "ExtensionManager::Instance()->isSupported(" #e ")"))
