// The base of every OpenGL rendering context, and the display devices contexts live on.
#pragma once

#include "oru/core/math/tvec2.h"
#include "oru/core/utility/export.h"
#include "oru/core/utility/windowsforward.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/ogl/bufferformat.h"
#include "oru/oru_ogl/ogl/displaydevicekey.h"

#include <cstddef>
#include <string>

namespace ORU::OGL {

/// An OpenGL rendering context on a device context of one display device.
///
/// Hosts make one of the derived kinds: ContextWindowed, ContextOffscreen, ContextWrapped. Making
/// one leaves the thread's current context as it was; call `makeCurrent()` to use it. A context is
/// used on one thread at a time.
///
/// ```cpp
/// AutoInitializer library;
/// ContextOffscreen context;        // on the primary display's adapter
/// context.makeCurrent();
/// ContextOffscreen second(&context); // shares its objects, for another thread
/// ```
///
/// A context stays where it is, neither copied nor moved: share groups and the registry of contexts
/// know it by its address. Keep one that is handed on by std::unique_ptr.
class ORU_API Context {
public:
    /// Where drawing goes in a window.
    enum Buffering {
        BUFFERING_SINGLE = 0, ///< to what is seen, at once
        BUFFERING_DOUBLE = 1  ///< to a back buffer, which `swapBuffers()` shows
    };

    /// Samples per pixel; any value above 1 asks for a multisampled pixel format.
    enum Multisampling : int {
        MULTISAMPLING_NONE = 1 ///< one sample; `Multisampling(4)` asks for four
    };

    /// What a pixel format must be able to draw to.
    enum Windowing {
        WINDOWING_PBUFFER = 0, ///< a pbuffer and not a window
        WINDOWING_WINDOW = 1   ///< a window
    };

    /// Releases nothing: the derived kinds release what they made.
    virtual ~Context();

    Context(Context const &) = delete;
    Context &operator=(Context const &) = delete;

    /// Makes this context current on the calling thread.
    /// @throws InternalException when the system refuses (it is current on another thread, say)
    /// @note wglMakeCurrent
    virtual void makeCurrent() const;

    /// The calling thread's current rendering context, or null. @note wglGetCurrentContext
    static HGLRC CurrentContext();

    HGLRC renderContext() const { return renderContext_; } ///< The context's WGL handle.
    HDC deviceContext() const { return deviceContext_; }   ///< What it draws to.

    /// The display device the context lives on; empty for one made from a bare handle.
    DisplayDeviceKey const &displayDeviceKey() const { return displayDeviceKey_; }

    /// Shows the back buffer of a double-buffered window. @note SwapBuffers
    void swapBuffers();

    /// The bits per channel of the pixel format that was really chosen.
    /// @note GetPixelFormat, DescribePixelFormat
    void getBitDepths(int *red, int *green, int *blue, int *alpha, int *stencil, int *depth) const;

    /// Whether objects of this context can be used in the calling thread's current context.
    /// @return false also when no context is current
    /// @throws InternalException when this context or the current one is in no share group
    bool isSharingWithCurrentContext() const;

    /// The profile of the options that were in force when the context was made.
    OpenGLProfile openGLProfile() const { return initOptions_.openGLProfile(); }

    /// Whether the current context can wait for the vertical retrace (WGL_EXT_swap_control).
    /// @throws InternalException when it has no record and the library is not initialised
    static bool SupportsVerticalRetraceControl();

    /// @name Display devices
    /// May be called without a current context; each call asks the system anew.
    /// @{

    /// Number of adapters with an output on the desktop; 0 also on any failure.
    static std::size_t NumDisplayDevice();

    /// The key of an adapter and its first output on the desktop.
    /// @param index the system's adapter index, which also counts adapters without outputs
    /// @param key set on success only
    /// @return false when there is no such adapter, it has no such output, or anything failed
    static bool DisplayDevice(std::size_t index, DisplayDeviceKey &key);
    /// @}

protected:
    /// For an adopted context; the device is not known.
    explicit Context(HGLRC renderContext);
    /// For a context to be made on a device.
    explicit Context(DisplayDeviceKey const &key);

    /// Sets a pixel format on a device context and makes this object's rendering context on it.
    /// The thread's current context is restored at the end. Floating-point, multisampled and
    /// deeper than 8-bit formats need WGL_ARB_pixel_format. The context is as the format's context
    /// attributes say, or where it has none, as the init options'.
    /// @param share context to share objects with, or null
    /// @throws LogicalException when no context can be made; nothing is left behind
    void initialize(HDC dc, BufferFormat const &format, Buffering buffering,
                    Multisampling multisampling, Context const *share);

    /// A pixel format by GDI, of integer channels and one sample.
    /// @throws InternalException for a null device context, or when there is no such format
    /// @note ChoosePixelFormat
    static int ChoosePixelFormat(HDC dc, BufferFormat const &format, bool doubleBuffered);

    /// A pixel format by wglChoosePixelFormatARB (WGL_ARB_pixel_format; with more than one sample
    /// WGL_ARB_multisample), for which a context must be current.
    /// @throws InternalException without that function, for a null device context, for several
    ///         samples without double buffering, or when there is no such format
    static int ChoosePixelFormat(HDC dc, BufferFormat const &format, Buffering buffering,
                                 Multisampling multisampling, Windowing windowing);

    /// Sets a device context's pixel format, which the system allows once for a window.
    /// @throws InternalException for an index below 1 or one that the system refuses
    /// @note SetPixelFormat
    void setPixelFormat(HDC dc, int pixelFormat);

    /// Chooses a pixel format by GDI, sets it and makes a rendering context.
    /// @throws InternalException when one of these steps fails
    HGLRC setupRenderingContext(HDC dc, BufferFormat const &format, bool doubleBuffered,
                                Context const *share);

    /// A rendering context that shares with `share`; where nothing is asked for, of version 3.0 or
    /// later where attributes can be given, else any.
    /// @throws InternalException for a null device context, or when the context cannot be made as
    ///         asked for or cannot share
    /// @note wglCreateContextAttribsARB (WGL_ARB_create_context) or wglCreateContext, wglShareLists
    /// @{
    HGLRC createRenderingContext(HDC dc, Context const *share); ///< as the init options ask
    /// As asked for here.
    /// @param attributes what is asked for
    HGLRC createRenderingContext(HDC dc, Context const *share, ContextAttributes const &attributes);
    /// @}

    /// Makes this context use another rendering context's objects; for hosts that derive.
    /// @throws InternalException when the system refuses
    /// @note wglShareLists
    void shareLists(HGLRC other);

    /// Registers the new context and puts it into `share`'s group (or one of its own); destroys
    /// the rendering context when that fails.
    /// @throws InternalException when `share` is in no group
    void publish(Context const *share);

    /// Deletes the rendering context; another context that was current is current again.
    /// @throws InternalException when the system refuses
    /// @note wglMakeCurrent, wglDeleteContext
    void destroyContext();

    /// Maps the rendering context to its device's record, or ends that; nothing without one. The
    /// kinds here register as they publish themselves; the first has its place in the binary
    /// interface.
    /// @throws InternalException when the record cannot be built, or when there is nothing to end
    void registerWithExtensionMgr();
    void unregisterWithExtensionMgr(); ///< Ends that.
    /// The options that were in force when the context was made.
    ExtensionManager::InitOptions const &initOptions() const { return initOptions_; }

    /// @name Share groups
    /// Contexts of one group share all objects. The groups are process-wide and not locked.
    /// @{

    /// Joins a sibling's group, or makes a new one when it is null.
    /// @throws InternalException when the sibling is this context or in no group
    void addShareContext(Context const *sibling) const;

    /// The same; has its place in the binary interface.
    void registerSharedContext(Context const *sibling);

    /// Leaves the group; nothing without a rendering context.
    void unregisterSharedContext();

    /// Finds the group of an adopted context by trying whether display lists are shared, or
    /// textures where one of the two contexts is a core one. Neither is left with a GL error.
    /// @note glGenLists, glIsList, glDeleteLists, or glGenTextures, glBindTexture, glIsTexture,
    ///       glDeleteTextures; not through the chain
    static void RegisterContextWrapped(Context const *context);

    /// Leaves its group; nothing for a context in none.
    static void UnregisterShareContext(Context const *context);
    /// @}

    /// The key of the output that shows a window, and of its adapter.
    /// @throws InternalException for no window, or when the system does not tell
    /// @note a Direct3D 11 swap chain on the window, which goes at once
    static DisplayDeviceKey DisplayDeviceFromWindow(HWND const &window);

    /// The key of the output at the desktop's origin, found out once.
    /// @throws InternalException when there is none
    static DisplayDeviceKey const &PrimaryDisplayDevice();

    /// The desktop position of the first output of the adapter with this description.
    /// @param defaultToZeroOnFailure whether a failing system call gives (0, 0) rather than throws
    /// @throws InternalException when there is no such adapter, in any case
    static ambra::lumo::TVec2<int> DisplayOrigin(std::string const &adapterName,
                                                 bool defaultToZeroOnFailure);

private:
    ContextAttributes attributesFor(BufferFormat const &format) const;
    HGLRC makeAsAsked(HDC dc, ContextAttributes const &attributes);
    static void requireAttributes(ContextAttributes const &attributes);

    // Read by nobody; they have their place in the binary interface.
    static void SetThrowTestException(bool value) { sThrowTestException_ = value; }
    static bool sThrowTestException_;

    DisplayDeviceKey displayDeviceKey_;
    ExtensionManager::InitOptions initOptions_;

protected:
    HDC deviceContext_ = nullptr;   ///< what the context draws to
    HGLRC renderContext_ = nullptr; ///< the context is live while this is not null
    int pixelFormat_ = 0;           ///< index set on the device context, 0 until then

    /// For a kind that learns its device late.
    void setDisplayDeviceKey(DisplayDeviceKey const &key) { displayDeviceKey_ = key; }
};

} // namespace ORU::OGL
