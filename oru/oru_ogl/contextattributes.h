// What a new rendering context is asked for besides its pixel format.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

/// The profile of a context: with (compatibility) or without (core) what OpenGL 3 deprecated.
enum OpenGLProfile : unsigned int {
    OPENGLPROFILE_DEFAULT = 0,      ///< the driver chooses
    OPENGLPROFILE_CORE = 1,         ///< without what OpenGL 3 deprecated
    OPENGLPROFILE_COMPATIBILITY = 2 ///< with it
};

/// Version, profile and flags that a host wants of new contexts. What is not set is left to the
/// driver; with nothing set, contexts are made as if there were no such object.
///
/// ```cpp
/// ExtensionManager::InitOptions options;
/// options.setContextAttributes(
///     ContextAttributes().setVersion(4, 5).setProfile(OPENGLPROFILE_CORE).setDebug());
/// ExtensionManager::SetInitOptions(options);
/// ```
///
/// A context that cannot be had so is not made: its constructor throws and says what the driver
/// refuses. A driver may give a later version than was asked for.
class ORU_API ContextAttributes {
public:
    /// Nothing is set.
    constexpr ContextAttributes()
        : major_(0), minor_(0), profile_(OPENGLPROFILE_DEFAULT), debug_(0), robust_(0), noError_(0),
          forwardCompatible_(0) {}

    /// The lowest OpenGL version that will do.
    /// @throws InternalException for a number above 15
    ContextAttributes &setVersion(unsigned int major, unsigned int minor);

    /// The core profile begins with OpenGL 3.2, which is asked for where no version is set.
    ContextAttributes &setProfile(OpenGLProfile profile) {
        profile_ = static_cast<unsigned short>(profile & 3);
        return *this;
    }

    /// A context that reports more of what goes wrong (glDebugMessageCallback).
    ContextAttributes &setDebug(bool on = true) {
        debug_ = on;
        return *this;
    }

    /// A context in which access outside a buffer harms nothing else.
    ContextAttributes &setRobust(bool on = true) {
        robust_ = on;
        return *this;
    }

    /// A context that need not look for errors: calls with mistakes have undefined results, and the
    /// library's checks find none.
    ContextAttributes &setNoError(bool on = true) {
        noError_ = on;
        return *this;
    }

    /// A context without what its version deprecates; OpenGL 3.0 or later.
    ContextAttributes &setForwardCompatible(bool on = true) {
        forwardCompatible_ = on;
        return *this;
    }

    /// @name What is set
    /// The version is 0.0 when none is, the profile OPENGLPROFILE_DEFAULT.
    /// @{
    unsigned int majorVersion() const { return major_; }
    unsigned int minorVersion() const { return minor_; }
    OpenGLProfile profile() const { return static_cast<OpenGLProfile>(profile_); }
    bool isDebug() const { return debug_; }
    bool isRobust() const { return robust_; }
    bool isNoError() const { return noError_; }
    bool isForwardCompatible() const { return forwardCompatible_; }
    /// @}

    /// Whether nothing is set.
    bool isDefault() const {
        return !major_ && !minor_ && !profile_ && !debug_ && !robust_ && !noError_ &&
               !forwardCompatible_;
    }

private:
    // Two bytes, as it lies in what was padding of classes whose layout hosts know.
    unsigned short major_ : 4;
    unsigned short minor_ : 4;
    unsigned short profile_ : 2;
    unsigned short debug_ : 1;
    unsigned short robust_ : 1;
    unsigned short noError_ : 1;
    unsigned short forwardCompatible_ : 1;
};

static_assert(sizeof(ContextAttributes) == 2, "It must fit into the padding of its holders.");

} // namespace ORU::OGL
