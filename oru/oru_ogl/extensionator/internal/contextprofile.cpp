// What the current context is: its version, and whether it is without what OpenGL 3 deprecated.
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"

#include "oru/oru_ogl/extensionator/internal/contextregistry.h"
#include "oru/oru_ogl/extensionator/internal/functioncast.h"
#include "oru/oru_ogl/platformgl.h"

#include <cstdlib>
#include <cstring>

namespace ORU::OGL::internal {

namespace {

GLint Ask(GLenum name) {
    GLint value = 0;
    ::glGetIntegerv(name, &value);
    return value;
}

/// OpenGL 3.1 has no profiles: an extension brings back what it removed.
bool HasCompatibilityExtension() {
    auto const getString = FunctionCast<PFNGLGETSTRINGIPROC>(::wglGetProcAddress("glGetStringi"));
    for (GLint i = getString ? Ask(GL_NUM_EXTENSIONS) : 0; i-- > 0;) {
        auto const *name =
            reinterpret_cast<char const *>(getString(GL_EXTENSIONS, static_cast<GLuint>(i)));
        if (name && !std::strcmp(name, "GL_ARB_compatibility"))
            return true;
    }
    return false;
}

/// The version text of the current context, empty without one.
char const *VersionText() {
    auto const *text = reinterpret_cast<char const *>(::glGetString(GL_VERSION));
    return text ? text : "";
}

/// Finds out what is not known, for a context that is current. Where the driver's version text says
/// it, nothing is asked that a recording of the calls would show.
bool AskWhetherCore(HGLRC context) {
    bool const isCore =
        !std::strstr(VersionText(), "Compatibility Profile") && ReadContextTraits().isCore;
    ContextRegistry::KeepProfile(context, isCore ? ContextRegistry::Profile::Core
                                                 : ContextRegistry::Profile::Compatibility);
    return isCore;
}

} // namespace

ContextTraits ReadContextTraits() {
    ContextTraits traits;
    char *end = nullptr;
    traits.major = static_cast<unsigned int>(std::strtoul(VersionText(), &end, 10));
    traits.minor = *end == '.' ? static_cast<unsigned int>(std::strtoul(end + 1, nullptr, 10)) : 0;
    // Questions that a version does not know would leave an error behind.
    if (traits.major < 3)
        return traits;
    traits.flags = Ask(GL_CONTEXT_FLAGS);
    traits.isCore = (traits.flags & GL_CONTEXT_FLAG_FORWARD_COMPATIBLE_BIT) != 0;
    if (traits.major > 3 || traits.minor >= 2)
        traits.isCore =
            traits.isCore || (Ask(GL_CONTEXT_PROFILE_MASK) & GL_CONTEXT_CORE_PROFILE_BIT);
    else if (traits.minor == 1)
        traits.isCore = traits.isCore || !HasCompatibilityExtension();
    return traits;
}

bool IsCoreContext() {
    HGLRC const context = ::wglGetCurrentContext();
    auto const known = ContextRegistry::FindProfile(context);
    if (known == ContextRegistry::Profile::Unknown)
        return context && AskWhetherCore(context);
    return known == ContextRegistry::Profile::Core;
}

bool IsCoreContext(HDC dc, HGLRC context) {
    auto const known = ContextRegistry::FindProfile(context);
    if (known != ContextRegistry::Profile::Unknown)
        return known == ContextRegistry::Profile::Core;
    HDC const currentDC = ::wglGetCurrentDC();
    HGLRC const current = ::wglGetCurrentContext();
    if (context == current)
        return AskWhetherCore(context);
    bool const isCore = ::wglMakeCurrent(dc, context) && AskWhetherCore(context);
    ::wglMakeCurrent(currentDC, current);
    return isCore;
}

} // namespace ORU::OGL::internal
