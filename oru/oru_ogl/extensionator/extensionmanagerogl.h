// The capability record of an OpenGL implementation, and the registries of records.
#pragma once

#include "oru/core/utility/export.h"
#include "oru/core/utility/sharedptr.h"
#include "oru/core/utility/windowsforward.h"
#include "oru/oru_ogl/contextattributes.h"
#include "oru/oru_ogl/displaydevicekey.h"
#include "oru/oru_ogl/extensionator/functiontable.h"
#include "oru/oru_ogl/extensionator/openglextension.h"

#include <bitset>
#include <cstddef>
#include <iosfwd>
#include <memory>
#include <set>
#include <string>
#include <vector>

namespace ORU::OGL {

class Context;
class OpenGLInterceptorDecorator;
class WGLInterceptorDecorator;

/// What one OpenGL implementation can do: versions, vendor, extensions, and its function table.
///
/// There is one record per display device, read once from a throw-away context of the device, and
/// one per rendering context that the host made itself, read at its first call through the
/// interceptor chain. Ask the current context's record before using a feature:
///
/// ```cpp
/// if (ExtensionManager::Instance()->isSupported(GL_ARB_PIXEL_BUFFER_OBJECT)) …
/// ```
///
/// A record does not change once built (but for the two float-filtering answers, which are found
/// out when first asked), so any thread may read it.
class ORU_API ExtensionManager {
public:
    /// Who made the implementation.
    enum Vendor : unsigned int {
        VENDOR_OTHER = 0, ///< none of those below
        VENDOR_AMD,       ///< GL_VENDOR has "AMD" or "ATI" in it, in letters of either case
        VENDOR_NVIDIA,    ///< "NVIDIA"
        VENDOR_INTEL      ///< "INTEL"
    };

    /// The options that each new context and record copies; kept for the host, the layer acts on
    /// none of them. `Library::InitOptions` has the first two for the library as a whole.
    class InitOptions {
    public:
        bool throwOnNullContext() const { return throwOnNullContext_; } ///< true unless set
        /// Kept for the host.
        void setThrowOnNullContext(bool value) { throwOnNullContext_ = value; }
        /// True unless set.
        bool flushOnMakeCurrentMacOnly() const { return flushOnMakeCurrentMacOnly_; }
        /// Kept for the host.
        void setFlushOnMakeCurrentMacOnly(bool value) { flushOnMakeCurrentMacOnly_ = value; }
        /// What Context::openGLProfile tells.
        OpenGLProfile openGLProfile() const { return profile_; }
        /// Kept for the host; contexts go by their attributes.
        void setOpenGLProfile(OpenGLProfile profile) { profile_ = profile; }

        /// What new contexts are asked for, unless their BufferFormat says so.
        ContextAttributes contextAttributes() const { return contextAttributes_; }
        /// See ContextAttributes.
        void setContextAttributes(ContextAttributes attributes) { contextAttributes_ = attributes; }

    private:
        bool throwOnNullContext_ = true;
        bool flushOnMakeCurrentMacOnly_ = true;
        ContextAttributes contextAttributes_; // where padding was
        OpenGLProfile profile_ = OPENGLPROFILE_DEFAULT;
    };
    static_assert(sizeof(InitOptions) == 8, "Hosts know its size.");

    /// Replaces the default options for a scope.
    class ORU_API ScopedInitOptions {
    public:
        /// Sets the options until the scope ends.
        explicit ScopedInitOptions(InitOptions const &options);
        ScopedInitOptions(ScopedInitOptions const &) = default;
        ScopedInitOptions &operator=(ScopedInitOptions const &) = default;
        /// Puts the options back that the constructor found.
        ~ScopedInitOptions();

    private:
        InitOptions previous_;
    };

    ~ExtensionManager();
    ExtensionManager(ExtensionManager const &) = delete;
    ExtensionManager &operator=(ExtensionManager const &) = delete;

    /// @name Records of rendering contexts
    /// @{

    /// The record of the calling thread's current context.
    /// @return null when there is none and the library is initialised
    /// @throws InternalException when there is none and the library is not initialised
    static ExtensionManager *Instance();

    /// The record of a rendering context; results and failures as above.
    static ExtensionManager *Instance(HGLRC const &rc);

    /// The record of a rendering context, made when it has none.
    /// @param rc the calling thread's current context
    /// @throws InternalException as `CurrentTable`
    static ExtensionManager *InstanceGuaranteed(HGLRC const &rc);

    /// The function table of the calling thread's current context, whose record is made when it has
    /// none (a context that the host created itself).
    /// @throws InternalException when there is no record and the library is not initialised, or
    ///         when the context does not even tell its version
    static FunctionTable const &CurrentTable();

    /// The same for a context that the caller knows to be current.
    static FunctionTable const &CurrentTable(HGLRC const &rc);

    /// Maps a context of the library to its device's record, building the record when it is the
    /// device's first. A context that is mapped already stays so.
    /// @throws InternalException when the record cannot be built
    static void RegisterContext(Context const &context);

    /// Ends the mapping of a context.
    /// @throws InternalException when the context is not registered
    static void UnRegisterContext(Context const &context);
    /// @}

    /// @name Records of display devices
    /// @{

    /// The record of a display device, built when it does not exist yet; the calling thread's
    /// current context is the same afterwards.
    /// @throws InternalException when there is no such adapter, or when its context does not even
    ///         tell its version
    static ExtensionManager *Instance(DisplayDeviceKey const &key);

    /// The record of a context's display device, built when it does not exist yet.
    /// @return for a null context null
    /// @throws InternalException for a null context while the library is not initialised, and as
    ///         above
    static ExtensionManager *Instance(Context const *context);

    /// Forgets all contexts and destroys the records of all display devices.
    static void Terminate();
    /// @}

    /// @name Options
    /// @{

    /// The options that new contexts and records copy.
    static InitOptions const &CurrentInitOptions();
    /// Contexts and records that exist keep theirs.
    static void SetInitOptions(InitOptions const &options);

    /// The options this record copied when it was made.
    InitOptions const &initOptions() const { return initOptions_; }
    /// @}

    /// @name Interceptors
    /// The same as the chain's own operations, after making sure that the chain exists.
    /// @{
    void addInterceptor(OpenGLInterceptorDecorator *decorator);
    OpenGLInterceptorDecorator *popInterceptor();
    void addWGLInterceptor(WGLInterceptorDecorator *decorator);
    WGLInterceptorDecorator *popWGLInterceptor();
    /// @}

    /// @name What the implementation says of itself
    /// @{

    /// The OpenGL version. Every 4.x above 4.1 is recorded as 4.1, the highest wrapped here.
    unsigned int majorVersion() const { return majorVersion_; }
    unsigned int minorVersion() const { return minorVersion_; } ///< of the OpenGL version

    /// The version text's third number.
    /// @throws InternalException when it has none
    unsigned int releaseVersion() const;
    /// Whether the version text has a third number.
    bool hasReleaseVersion() const { return releaseVersion_ != -1; }

    /// What follows the numbers in the version text.
    std::string additionalVersionInfo() const { return additionalVersionInfo_; }

    /// The shading-language version, 0.0 when the implementation has none.
    unsigned int glslMajorVersion() const { return glslMajorVersion_; }
    unsigned int glslMinorVersion() const { return glslMinorVersion_; } ///< of the shading language

    Vendor vendor() const { return vendor_; } ///< Who made it, by GL_VENDOR.
    /// "AMD", "NVIDIA", "INTEL" or "OTHER".
    std::string vendorString() const;
    /// @}

    /// The device the record describes; empty in the record of a context that the host made.
    DisplayDeviceKey const &displayDeviceKey() const { return displayDeviceKey_; }

    /// @name Extensions and entry points
    /// @{

    /// Whether a capability is there with all its entry points.
    bool isSupported(OpenGLExtension e) const { return e < kMostCapabilities && isSupported_[e]; }
    /// All capabilities that `isSupported` affirms.
    std::set<OpenGLExtension> const &supportedExtensions() const { return supported_; }

    /// Every GL extension that the implementation names, known here or not, then the WGL extensions
    /// that were recognised and loaded.
    std::vector<std::string> const &supportedExtensionNames() const { return supportedNames_; }

    /// The capability of an exact GL extension string (not of a WGL one), or
    /// UNKNOWN_OPENGL_EXTENSION.
    OpenGLExtension nameToEnumGL(char const *name);

    /// The exact string of a capability, of OpenGL or of WGL; empty for a value that is none.
    static std::string ExtensionEnumToString(OpenGLExtension e);

    /// Whether the implementation claims a capability: names it, or supports an OpenGL version that
    /// includes it. What is claimed and not supported lacks entry points; see
    /// `missingEntryPoints`.
    /// @param e a WGL capability is looked for in what the current context names, which must be one
    ///     of the record's device; without a context it is not reported
    /// @note wglGetExtensionsStringARB for a WGL capability
    bool isReported(OpenGLExtension e) const;

    /// The entry points of a capability that were asked for and not found; of one that is not
    /// reported all, as nobody asked.
    std::vector<std::string> missingEntryPoints(OpenGLExtension e) const;

    /// Loads a GL capability's entry points from the current context.
    /// @return whether all were found; true for a GL capability without any, false for a WGL one
    bool initializeGL(OpenGLExtension e);

    /// Adds a GL or WGL capability to the supported ones when its entry points can be loaded.
    /// @return whether it is supported now
    bool initialize(OpenGLExtension e);

    /// The entry points.
    /// @throws InternalException when the record has no table
    FunctionTable const &table() const;

    // One loader per GL capability: asks for each entry point of its group with wglGetProcAddress,
    // stores every answer and tells whether all were found.
#include "oru/oru_ogl/extensionator/extensionmanagerogl_loaders.inc"
    /// @}

    /// @name Capability shortcuts
    /// @{
    bool supportsClampToEdge() const;  ///< WRAPMODE_CLAMP_TO_EDGE: OpenGL 1.2
    bool supportsTexture3D() const;    ///< OpenGL 1.2 or GL_EXT_texture3D
    bool supportsMultiTexture() const; ///< OpenGL 1.3 or GL_ARB_multitexture
    /// Several colours drawn at once: OpenGL 2.0 or GL_ARB_draw_buffers.
    bool supportsDrawBuffers() const;
    /// GL_ARB_texture_float, GL_ATI_texture_float or GL_APPLE_float_pixels
    bool supportsFloatingPointTextures() const;
    /// TYPE_HALF_FLOAT in transfers: GL_ARB_half_float_pixel or GL_APPLE_float_pixels
    bool supports16BitFloat() const;
    /// Pbuffers, not pixel buffer objects: WGL_ARB_pixel_format and WGL_ARB_pbuffer
    bool supportsPixelBuffers() const;
    bool supportsRenderToTexture() const; ///< Pbuffers as textures: WGL_ARB_render_texture
    /// The same for rectangles: WGL_NV_render_texture_rectangle
    bool supportsRenderToTextureRectangle() const;

    /// Whether textures of any size work. On one vendor's implementations the version does not
    /// promise that they work well, so there the extension must be named.
    bool supportsNonPowerOfTwoTextures() const {
        return nonPowerOfTwo_;
    }

    /// Whether 32-bit floating-point textures can be filtered linearly, which no version and no
    /// extension tells. The first call draws a test in a context that shares with the current one
    /// and may take a while; the answer then holds for the record's life. A test that fails in any
    /// way answers false.
    bool supportsFloatFiltering();

    /// The same for 16-bit floats; false, without a test, where GL_EXT_gpu_shader4 is missing.
    bool supportsHalfFiltering();

    /// Number of texture image units of the current context, 1 without multitexturing.
    /// @note glGetIntegerv through the chain
    unsigned int numberOfTextureUnits() const;
    /// @}

private:
    friend class Context;

    using CreateContextAttribs = HGLRC(ORU_APIENTRY *)(HDC, HGLRC, int const *);
    using GroupLoader = bool (ExtensionManager::*)();

    /// An answer that is found out when first asked for.
    struct CachedAnswer {
        bool isKnown = false;
        bool value = false;
    };

    static constexpr std::size_t kMostCapabilities = 1024;

    explicit ExtensionManager(HGLRC rc);
    explicit ExtensionManager(Context *context);

    static ExtensionManager *Find(DisplayDeviceKey const &key);
    static ExtensionManager *Create(DisplayDeviceKey const &key);
    static ExtensionManager *Create(HGLRC rc);
    static ExtensionManager *NullExtensionManager();
    static FunctionTable const &FindOrMakeTable(HGLRC rc);

    void initialize();
    void readVendor();
    void readVersions();
    void climbVersionLadder();
    void readExtensions();
    void readWGLExtensions();
    bool testFloatFiltering();
    bool testHalfFiltering();
    void noteSupported(OpenGLExtension e);
    bool loadGroup(std::size_t first, std::size_t count);
    std::string getExtensionsString() const;
    static void TokenizeExtensionString(std::string const &text, std::vector<std::string> &out);
    // Called by nobody; has its place in the binary interface.
    void tryInitializing(OpenGLExtension e, bool required);
    CreateContextAttribs getWglCreateContextAttribsPtr() const {
        return createContextAttribs_;
    }

    static GroupLoader const sGroupLoaders_[]; // by capability, null for those of WGL
    static InitOptions sInitOptions_;
    static ExtensionManager *sCachedNullExtMgrInstance_; // the answer without a context: null

    CreateContextAttribs createContextAttribs_ = nullptr;
    std::set<OpenGLExtension> supported_;
    unsigned int majorVersion_ = 0;
    unsigned int minorVersion_ = 0;
    int releaseVersion_ = -1;
    std::string additionalVersionInfo_;
    Vendor vendor_ = VENDOR_OTHER;
    bool nonPowerOfTwo_ = false;
    CachedAnswer halfFiltering_;
    CachedAnswer floatFiltering_;
    std::shared_ptr<FunctionTable> tableExt_;
    DisplayDeviceKey displayDeviceKey_;
    std::vector<std::string> supportedNames_;
    InitOptions initOptions_;
    unsigned int glslMajorVersion_ = 0;
    unsigned int glslMinorVersion_ = 0;
    std::bitset<kMostCapabilities> isSupported_; ///< what is in `supported_`, found at once
};

/// Prints the versions and the names of the supported extensions, one a line.
ORU_API std::ostream &operator<<(std::ostream &os, ExtensionManager const &m);

} // namespace ORU::OGL
