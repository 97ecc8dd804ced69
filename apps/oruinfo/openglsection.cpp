// Who made the OpenGL, its versions, and the profiles that contexts can have.
#include "apps/oruinfo/drivers.h"
#include "apps/oruinfo/failuretext.h"
#include "apps/oruinfo/report.h"
#include "apps/oruinfo/sections.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/wgl/extensionswgl.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/ogl/oruopengl.h"
#include "oru/oru_ogl/platformgl.h"

namespace OruInfo {

using namespace ORU::OGL;

namespace {

std::string VersionText(unsigned int major, unsigned int minor) {
    return std::to_string(major) + "." + std::to_string(minor);
}

/// The version of a context with these attributes.
std::string VersionWith(ContextAttributes const &attributes) {
    ExtensionManager::InitOptions options;
    options.setContextAttributes(attributes);
    ExtensionManager::ScopedInitOptions const scope(options);
    ContextOffscreen const context;
    context.makeCurrent();
    return GetGLString(GL_VERSION);
}

/// A context of OpenGL ES, which the library itself does not make.
class EmbeddedContext {
public:
    explicit EmbeddedContext(HDC dc) {
        if (!_wcgmCreateContextAttribsARB)
            ORU_THROW_INTERNAL("WGL_ARB_create_context is not reported");
        int const attributes[] = {WGL_CONTEXT_MAJOR_VERSION_ARB,
                                  2,
                                  WGL_CONTEXT_MINOR_VERSION_ARB,
                                  0,
                                  WGL_CONTEXT_PROFILE_MASK_ARB,
                                  WGL_CONTEXT_ES2_PROFILE_BIT_EXT,
                                  0};
        context_ = _wcgmCreateContextAttribsARB(dc, nullptr, attributes);
        if (!context_)
            ORU_THROW_INTERNAL("the driver refuses OpenGL ES");
        if (!ORU_WGL(MakeCurrent, dc, context_)) {
            ORU_WGL(DeleteContext, context_);
            ORU_THROW_INTERNAL("the driver does not make its OpenGL ES context current");
        }
    }
    ~EmbeddedContext() {
        ORU::DropExceptions([] { ORU_WGL(MakeCurrent, nullptr, nullptr); });
        ORU::DropExceptions([this] { ORU_WGL(DeleteContext, context_); });
    }
    EmbeddedContext(EmbeddedContext const &) = delete;
    EmbeddedContext &operator=(EmbeddedContext const &) = delete;

private:
    HGLRC context_ = nullptr;
};

bool NamesEmbeddedProfile(HDC dc) {
    char const *const names =
        _wcgmGetExtensionsStringARB ? _wcgmGetExtensionsStringARB(dc) : nullptr;
    return names && std::string(names).find("WGL_EXT_create_context_es") != std::string::npos;
}

std::string EmbeddedVersion(HDC dc) {
    if (!NamesEmbeddedProfile(dc))
        ORU_THROW_INTERNAL("WGL_EXT_create_context_es2_profile is not reported");
    EmbeddedContext const context(dc);
    return GetGLString(GL_VERSION);
}

template<class Ask>
void AddProfile(std::string const &name, Table &profiles, Ask const &versionOf) {
    Value const version = Told([&] { return Value(versionOf()); });
    auto const *const missing = std::get_if<Unavailable>(&version.content);
    profiles.rows.push_back({name, missing == nullptr, missing ? Value(Unavailable{}) : version,
                             missing ? Value(missing->why) : Value(Unavailable{})});
}

} // namespace

void GatherOpenGL(Drivers &drivers, Group &section) {
    ContextOffscreen const &context = drivers.openGL();
    ExtensionManager const &record = *ExtensionManager::Instance();
    section.add("adapter", "Adapter", context.displayDeviceKey().adapterName);
    section.add("output", "Output", context.displayDeviceKey().displayName);
    section.add("vendor", "Vendor", GetGLString(GL_VENDOR));
    section.add("vendor_kind", "Vendor as the library sees it", record.vendorString());
    section.add("renderer", "Renderer", GetGLString(GL_RENDERER));
    section.add("version", "Version", GetGLString(GL_VERSION));
    section.add("wrapped_version", "Version that the library wraps",
                VersionText(record.majorVersion(), record.minorVersion()));
    section.add("glsl_version", "GLSL version", GetGLString(GL_SHADING_LANGUAGE_VERSION));

    Table profiles{{{"name", "Profile"},
                    {"is_available", "Available"},
                    {"version", "Version"},
                    {"why_not", "Why not"}},
                   {}};
    AddProfile("compatibility", profiles, [] { return VersionWith(ContextAttributes()); });
    AddProfile("core", profiles,
               [] { return VersionWith(ContextAttributes().setProfile(OPENGLPROFILE_CORE)); });
    AddProfile("embedded", profiles, [&] { return EmbeddedVersion(context.deviceContext()); });
    context.makeCurrent();
    section.add("profiles", "Profiles", profiles);
}

} // namespace OruInfo
