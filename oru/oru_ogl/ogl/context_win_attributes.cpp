// Rendering contexts on Windows: making one as its attributes want it, or saying why not.
#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/ogl/context.h"
#include "oru/oru_ogl/platformgl.h"

#include <vector>

namespace ORU::OGL {

namespace {

struct Version {
    unsigned int major;
    unsigned int minor;

    bool operator<(Version const &other) const {
        return major != other.major ? major < other.major : minor < other.minor;
    }
};

/// The version to ask for. A driver knows the core profile from 3.2 on only.
Version VersionFor(ContextAttributes const &attributes) {
    if (attributes.majorVersion() || attributes.minorVersion())
        return {attributes.majorVersion(), attributes.minorVersion()};
    return attributes.profile() == OPENGLPROFILE_CORE ? Version{3, 2} : Version{3, 0};
}

/// Something that attributes may ask for.
struct Wish {
    std::string name;
    bool isMade;
    ContextAttributes others; ///< without it
};

std::vector<Wish> WishesOf(ContextAttributes const &a) {
    auto const without = [&a](auto remove) {
        ContextAttributes others = a;
        remove(others);
        return others;
    };
    using A = ContextAttributes &;
    bool const isCore = a.profile() == OPENGLPROFILE_CORE;
    return {
        {ComposeText("OpenGL ", a.majorVersion(), ".", a.minorVersion()),
         a.majorVersion() || a.minorVersion(), without([](A o) { o.setVersion(0, 0); })},
        {isCore ? "the core profile" : "the compatibility profile",
         a.profile() != OPENGLPROFILE_DEFAULT,
         without([](A o) { o.setProfile(OPENGLPROFILE_DEFAULT); })},
        {"debug", a.isDebug(), without([](A o) { o.setDebug(false); })},
        {"robust access", a.isRobust(), without([](A o) { o.setRobust(false); })},
        {"no error", a.isNoError(), without([](A o) { o.setNoError(false); })},
        {"forward compatibility", a.isForwardCompatible(),
         without([](A o) { o.setForwardCompatible(false); })},
    };
}

/// All that attributes ask for.
std::string Describe(ContextAttributes const &attributes) {
    std::string text;
    for (Wish const &wish : WishesOf(attributes)) {
        if (wish.isMade)
            text += (text.empty() ? "" : ", ") + wish.name;
    }
    return text;
}

/// The list for wglCreateContextAttribsARB, with the zero that ends it.
std::vector<int> ListOf(ContextAttributes const &attributes) {
    Version const version = VersionFor(attributes);
    std::vector<int> list = {WGL_CONTEXT_MAJOR_VERSION_ARB, static_cast<int>(version.major),
                             WGL_CONTEXT_MINOR_VERSION_ARB, static_cast<int>(version.minor)};
    int const flags =
        (attributes.isDebug() ? WGL_CONTEXT_DEBUG_BIT_ARB : 0) |
        (attributes.isForwardCompatible() ? WGL_CONTEXT_FORWARD_COMPATIBLE_BIT_ARB : 0) |
        (attributes.isRobust() ? WGL_CONTEXT_ROBUST_ACCESS_BIT_ARB : 0);
    if (attributes.profile() != OPENGLPROFILE_DEFAULT)
        list.insert(list.end(), {WGL_CONTEXT_PROFILE_MASK_ARB,
                                 attributes.profile() == OPENGLPROFILE_CORE
                                     ? WGL_CONTEXT_CORE_PROFILE_BIT_ARB
                                     : WGL_CONTEXT_COMPATIBILITY_PROFILE_BIT_ARB});
    if (flags)
        list.insert(list.end(), {WGL_CONTEXT_FLAGS_ARB, flags});
    if (attributes.isNoError())
        list.insert(list.end(), {WGL_CONTEXT_OPENGL_NO_ERROR_ARB, 1});
    list.push_back(0);
    return list;
}

/// A system error in words; drivers give those of WGL with or without a facility before them.
std::string ErrorText(DWORD error) {
    DWORD const code = error >> 16 == 0xC007 ? error & 0xFFFF : error;
    return ComposeText("Windows error ", code,
                       code == ERROR_INVALID_VERSION_ARB   ? ", ERROR_INVALID_VERSION_ARB"
                       : code == ERROR_INVALID_PROFILE_ARB ? ", ERROR_INVALID_PROFILE_ARB"
                                                           : "");
}

} // namespace

HGLRC Context::makeAsAsked(HDC dc, ContextAttributes const &attributes) {
    ExtensionManager const *const manager = ExtensionManager::Instance(displayDeviceKey_);
    auto const create = manager ? manager->getWglCreateContextAttribsPtr() : nullptr;
    if (!create)
        ORU_THROW_INTERNAL(
            "A context with attributes (", Describe(attributes),
            ") needs WGL_ARB_create_context, which the driver does not have: ask for none");
    if (HGLRC const context = create(dc, nullptr, ListOf(attributes).data()))
        return context;

    std::string const error = ErrorText(::GetLastError());
    // What is refused is what a context can be made without.
    std::string refused = "the combination";
    for (Wish const &wish : WishesOf(attributes)) {
        HGLRC const made = wish.isMade ? create(dc, nullptr, ListOf(wish.others).data()) : nullptr;
        if (!made)
            continue;
        ORU_WGL(DeleteContext, made);
        refused = wish.name;
        break;
    }
    ORU_THROW_INTERNAL("No context of ", Describe(attributes), ": the driver refuses ", refused,
                       " (", error, "). Ask for less, or update the driver");
}

void Context::requireAttributes(ContextAttributes const &attributes) {
    internal::ContextTraits const traits = internal::ReadContextTraits();
    bool const isOld = Version{traits.major, traits.minor} < VersionFor(attributes);
    bool const hasOtherProfile = attributes.profile() != OPENGLPROFILE_DEFAULT &&
                                 traits.isCore != (attributes.profile() == OPENGLPROFILE_CORE);
    int const missing =
        ~traits.flags & ((attributes.isDebug() ? GL_CONTEXT_FLAG_DEBUG_BIT : 0) |
                         (attributes.isRobust() ? GL_CONTEXT_FLAG_ROBUST_ACCESS_BIT : 0));
    if (isOld || hasOtherProfile || missing)
        ORU_THROW_INTERNAL("Instead of a context of ", Describe(attributes),
                           " the driver made one of OpenGL ", traits.major, ".", traits.minor,
                           traits.isCore ? " core" : "", ", without ",
                           isOld             ? "that version"
                           : hasOtherProfile ? "that profile"
                                             : "debug or robust access",
                           ". Ask for less, or update the driver");
}

} // namespace ORU::OGL
