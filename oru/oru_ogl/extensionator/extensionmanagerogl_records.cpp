// Where capability records are kept and how the one of a device or context is found or made.
#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/internal/contextregistry.h"
#include "oru/oru_ogl/extensionator/internal/contextservices.h"
#include "oru/oru_ogl/extensionator/openglinterceptor.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"

#include <tbb/concurrent_hash_map.h>
#include <tbb/spin_mutex.h>

namespace ORU::OGL {

using internal::ContextRegistry;

namespace {

/// The records of display devices by device id.
using DeviceRegistry = tbb::concurrent_hash_map<std::string, std::shared_ptr<ExtensionManager>>;

// The registries are never destroyed: at process exit their records' deleters would call into the
// host's memory hooks when the host's own statics are gone already.

DeviceRegistry &TheDeviceRegistry() {
    static auto &registry = *new DeviceRegistry;
    return registry;
}

/// The records of contexts that the host made. The host does not say when such a context dies, so
/// its record lives until the process ends.
void KeepAlive(std::shared_ptr<ExtensionManager> record) {
    static tbb::spin_mutex mutex;
    static auto &records = *new std::vector<std::shared_ptr<ExtensionManager>>;
    tbb::spin_mutex::scoped_lock lock(mutex);
    records.push_back(std::move(record));
}

} // namespace

ExtensionManager::InitOptions ExtensionManager::sInitOptions_;
ExtensionManager *ExtensionManager::sCachedNullExtMgrInstance_ = nullptr;

ExtensionManager::ScopedInitOptions::ScopedInitOptions(InitOptions const &options)
    : previous_(sInitOptions_) {
    sInitOptions_ = options;
}

ExtensionManager::ScopedInitOptions::~ScopedInitOptions() {
    sInitOptions_ = previous_;
}

ExtensionManager::InitOptions const &ExtensionManager::CurrentInitOptions() {
    return sInitOptions_;
}

void ExtensionManager::SetInitOptions(InitOptions const &options) {
    sInitOptions_ = options;
}

ExtensionManager *ExtensionManager::NullExtensionManager() {
    if (!internal::IsLibraryInitialized())
        ORU_THROW_INTERNAL("OGL Library must be initialized to use Instance()");
    return sCachedNullExtMgrInstance_;
}

ExtensionManager *ExtensionManager::Instance() {
    return Instance(ORU_WGL0(GetCurrentContext));
}

ExtensionManager *ExtensionManager::Instance(HGLRC const &rc) {
    ExtensionManager *const record = ContextRegistry::Find(rc);
    return record ? record : NullExtensionManager();
}

FunctionTable const &ExtensionManager::CurrentTable() {
    // The look-up of the other form once more, so that the handle stays in a register.
    HGLRC const rc = ORU_WGL0(GetCurrentContext);
    if (FunctionTable const *table = ContextRegistry::FindTable(rc))
        return *table;
    return FindOrMakeTable(rc);
}

FunctionTable const &ExtensionManager::CurrentTable(HGLRC const &rc) {
    if (FunctionTable const *table = ContextRegistry::FindTable(rc))
        return *table;
    return FindOrMakeTable(rc);
}

FunctionTable const &ExtensionManager::FindOrMakeTable(HGLRC rc) {
    if (ExtensionManager const *record = Instance(rc))
        return record->table();
    HGLRC const current = ORU_WGL0(GetCurrentContext);
    ExtensionManager *const record = Create(current);
    ContextRegistry::Insert(current, record, &record->table());
    return record->table();
}

ExtensionManager *ExtensionManager::InstanceGuaranteed(HGLRC const &rc) {
    if (ExtensionManager *record = ContextRegistry::Find(rc))
        return record;
    CurrentTable(rc);
    return ContextRegistry::Find(rc);
}

ExtensionManager *ExtensionManager::Create(HGLRC rc) {
    auto record = MakeShared(ORU_NEW ExtensionManager(rc));
    ExtensionManager *const result = record.get();
    KeepAlive(std::move(record));
    return result;
}

ExtensionManager *ExtensionManager::Instance(DisplayDeviceKey const &key) {
    ExtensionManager *const record = Find(key);
    return record ? record : Create(key);
}

ExtensionManager *ExtensionManager::Instance(Context const *context) {
    return context ? Instance(internal::DisplayDeviceOf(*context)) : NullExtensionManager();
}

ExtensionManager *ExtensionManager::Find(DisplayDeviceKey const &key) {
    DeviceRegistry::const_accessor entry;
    return TheDeviceRegistry().find(entry, key.deviceID) ? entry->second.get() : nullptr;
}

ExtensionManager *ExtensionManager::Create(DisplayDeviceKey const &key) {
    ExtensionManager *result = nullptr;
    internal::WithBootstrapContext(key, [&key, &result](Context *bootstrap) {
        auto const record = MakeShared(ORU_NEW ExtensionManager(bootstrap));
        if (TheDeviceRegistry().insert(DeviceRegistry::value_type(key.deviceID, record)))
            result = record.get();
        else
            result = Find(key); // another thread was first; this record goes with its pointer
    });
    return result;
}

void ExtensionManager::RegisterContext(Context const &context) {
    ExtensionManager *const record = Instance(internal::DisplayDeviceOf(context));
    HGLRC const rc = internal::RenderContextOf(context);
    ContextRegistry::Insert(rc, record, &record->table());
    ContextRegistry::Hold(rc);
}

void ExtensionManager::UnRegisterContext(Context const &context) {
    bool const wasRegistered = ContextRegistry::Erase(internal::RenderContextOf(context));
    ORU_ASSERT_TEXT("bFound", wasRegistered);
}

void ExtensionManager::Terminate() {
    ORUDeleter<ExtensionManager>()(sCachedNullExtMgrInstance_);
    sCachedNullExtMgrInstance_ = nullptr;
    ContextRegistry::Clear();
    TheDeviceRegistry().clear();
}

void ExtensionManager::addInterceptor(OpenGLInterceptorDecorator *decorator) {
    OpenGLInterceptor::Instance()->addInterceptor(decorator);
}

OpenGLInterceptorDecorator *ExtensionManager::popInterceptor() {
    return OpenGLInterceptor::Instance()->popInterceptor();
}

void ExtensionManager::addWGLInterceptor(WGLInterceptorDecorator *decorator) {
    WGLInterceptor::Instance()->addInterceptor(decorator);
}

WGLInterceptorDecorator *ExtensionManager::popWGLInterceptor() {
    return WGLInterceptor::Instance()->popInterceptor();
}

} // namespace ORU::OGL
