// The capability record of an OpenGL implementation: what is read from it and what it answers.
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/tokenize.h"
#include "oru/core/utility/versionstring.h"
#include "oru/oru_ogl/extensionator/internal/catalogueogl.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/internal/contextservices.h"
#include "oru/oru_ogl/extensionator/internal/findextension.h"
#include "oru/oru_ogl/extensionator/internal/functioncast.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/extensionator/wgl/extensionswgl.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/platformgl.h"

#include <cstddef>
#include <cstring>
#include <initializer_list>
#include <ostream>

namespace ORU::OGL {

namespace {

/// A step of the version ladder: an OpenGL version and the capabilities that belong to it.
struct Rung {
    unsigned int major;
    unsigned int minor;
    OpenGLExtension version;
    std::initializer_list<OpenGLExtension> extensions;
};

// Every version holds the ones below it, so a version's rung is where the climb down starts.
Rung const kLadder[] = {
    {4,
     1,
     GL_VERSION_4_1,
     {GL_ARB_ES2_COMPATIBILITY, GL_ARB_GET_PROGRAM_BINARY, GL_ARB_SEPARATE_SHADER_OBJECTS,
      GL_ARB_SHADER_PRECISION, GL_ARB_VERTEX_ATTRIB_64BIT, GL_ARB_VIEWPORT_ARRAY}},
    {4,
     0,
     GL_VERSION_4_0,
     {GL_ARB_TEXTURE_QUERY_LOD, GL_ARB_DRAW_INDIRECT, GL_ARB_GPU_SHADER5, GL_ARB_GPU_SHADER_FP64,
      GL_ARB_SHADER_SUBROUTINE, GL_ARB_TESSELLATION_SHADER, GL_ARB_TEXTURE_BUFFER_OBJECT_RGB32,
      GL_ARB_TEXTURE_CUBE_MAP_ARRAY, GL_ARB_TEXTURE_GATHER, GL_ARB_TRANSFORM_FEEDBACK2,
      GL_ARB_TRANSFORM_FEEDBACK3}},
    {3,
     3,
     GL_VERSION_3_3,
     {GL_ARB_BLEND_FUNC_EXTENDED, GL_ARB_SAMPLER_OBJECTS, GL_ARB_EXPLICIT_ATTRIB_LOCATION,
      GL_ARB_OCCLUSION_QUERY2, GL_ARB_SHADER_BIT_ENCODING, GL_ARB_TEXTURE_RGB10_A2UI,
      GL_ARB_TEXTURE_SWIZZLE, GL_ARB_TIMER_QUERY, GL_ARB_VERTEX_TYPE_2_10_10_10_REV}},
    {3,
     2,
     GL_VERSION_3_2,
     {GL_ARB_DRAW_ELEMENTS_BASE_VERTEX, GL_ARB_PROVOKING_VERTEX, GL_ARB_SYNC,
      GL_ARB_TEXTURE_MULTISAMPLE}},
    {3, 1, GL_VERSION_3_1, {GL_ARB_COPY_BUFFER, GL_ARB_UNIFORM_BUFFER_OBJECT}},
    {3,
     0,
     GL_VERSION_3_0,
     {GL_ARB_FRAMEBUFFER_OBJECT, GL_ARB_MAP_BUFFER_RANGE, GL_ARB_VERTEX_ARRAY_OBJECT}},
    {2, 1, GL_VERSION_2_1, {}},
    {2, 0, GL_VERSION_2_0, {}},
    {1, 5, GL_VERSION_1_5, {}},
    {1, 4, GL_VERSION_1_4, {}},
    {1, 3, GL_VERSION_1_3, {}},
    {1, 2, GL_VERSION_1_2, {}},
};

/// A GL string by the plain call: the interceptor chain needs the record that is being built.
std::string GLString(GLenum name) {
    auto const *const text = reinterpret_cast<char const *>(::glGetString(name));
    return text ? text : "";
}

/// What the current context names of WGL.
std::vector<std::string> WGLExtensionNames() {
    std::vector<std::string> names;
    if (auto const stored = _wcgmGetExtensionsStringARB) {
        char const *const text = stored(ORU_WGL0(GetCurrentDC));
        Tokenize(text ? text : "", " ", names);
    }
    return names;
}

bool Contains(std::vector<std::string> const &names, std::string const &name) {
    return std::find(names.begin(), names.end(), name) != names.end();
}

/// What a test answers; no when it fails with whatever exception.
template<class Test>
bool Passes(Test test) {
    try {
        return test();
    } catch (...) {
        return false;
    }
}

} // namespace

ExtensionManager::ExtensionManager(HGLRC rc)
    : tableExt_(MakeShared(ORU_NEW FunctionTable())), initOptions_(CurrentInitOptions()) {
    if (rc)
        initialize();
}

ExtensionManager::ExtensionManager(Context *context)
    : tableExt_(MakeShared(ORU_NEW FunctionTable())),
      displayDeviceKey_(internal::DisplayDeviceOf(*context)), initOptions_(CurrentInitOptions()) {
    internal::MakeContextCurrent(*context);
    initialize();
}

ExtensionManager::~ExtensionManager() = default;

void ExtensionManager::initialize() {
    readVendor();
    readVersions();
    climbVersionLadder();
    readExtensions();
    readWGLExtensions();
    nonPowerOfTwo_ = isSupported(GL_ARB_TEXTURE_NON_POWER_OF_TWO) ||
                     (vendor_ != VENDOR_NVIDIA && isSupported(GL_VERSION_2_0));
}

void ExtensionManager::readVendor() {
    std::string text = GLString(GL_VENDOR);
    for (char &c : text)
        if (c >= 'a' && c <= 'z')
            c = static_cast<char>(c - 'a' + 'A');
    auto const names = [&text](char const *maker) { return text.find(maker) != std::string::npos; };
    if (names("NVIDIA"))
        vendor_ = VENDOR_NVIDIA;
    else if (names("INTEL"))
        vendor_ = VENDOR_INTEL;
    else if (names("AMD") || names("ATI"))
        vendor_ = VENDOR_AMD;
}

void ExtensionManager::readVersions() {
    std::string const version = GLString(GL_VERSION);
    ORU_ASSERT_TEXT("!sVersionLong.empty()", !version.empty());
    TokenizeVersionString(version, majorVersion_, minorVersion_, releaseVersion_,
                          additionalVersionInfo_);
    if (majorVersion_ == 4 && minorVersion_ > 1)
        minorVersion_ = 1;

    std::string const glsl = GLString(GL_SHADING_LANGUAGE_VERSION);
    int release;
    std::string rest;
    TokenizeVersionString(glsl.empty() ? "0.0" : glsl, glslMajorVersion_, glslMinorVersion_,
                          release, rest);
}

void ExtensionManager::noteSupported(OpenGLExtension e) {
    static_assert(UNKNOWN_OPENGL_EXTENSION <= kMostCapabilities);
    supported_.insert(e);
    isSupported_.set(e);
}

void ExtensionManager::climbVersionLadder() {
    bool reached = false;
    for (Rung const &rung : kLadder) {
        reached = reached || (majorVersion_ == rung.major && minorVersion_ == rung.minor);
        if (!reached || !initializeGL(rung.version))
            continue;
        noteSupported(rung.version);
        for (OpenGLExtension const e : rung.extensions)
            initialize(e);
    }
}

void ExtensionManager::readExtensions() {
    TokenizeExtensionString(getExtensionsString(), supportedNames_);
    for (std::string const &name : supportedNames_) {
        OpenGLExtension const e = nameToEnumGL(name.c_str());
        if (e != UNKNOWN_OPENGL_EXTENSION && initializeGL(e))
            noteSupported(e);
    }
}

void ExtensionManager::readWGLExtensions() {
    InitializeWGLExtension(WGL_ARB_EXTENSIONS_STRING);
    for (std::string const &name : WGLExtensionNames()) {
        OpenGLExtension const e = FindExtension(kWGLExtensions, name.c_str());
        if (!InitializeWGLExtension(e))
            continue;
        noteSupported(e);
        supportedNames_.push_back(name);
    }

    // Looked up again, not taken from the process-wide pointer, which another thread may rewrite.
    auto const getExtensionsString = internal::FunctionCast<PFNWGLGETEXTENSIONSSTRINGARBPROC>(
        ORU_WGL(GetProcAddress, "wglGetExtensionsStringARB"));
    if (!getExtensionsString)
        return;
    char const *const text = getExtensionsString(ORU_WGL0(GetCurrentDC));
    if (text && std::strstr(text, "WGL_ARB_create_context"))
        createContextAttribs_ = internal::FunctionCast<CreateContextAttribs>(
            ORU_WGL(GetProcAddress, "wglCreateContextAttribsARB"));
}

std::string ExtensionManager::getExtensionsString() const {
    if (majorVersion_ < 3)
        return GLString(GL_EXTENSIONS);
    GLint count = 0;
    ORU_GL(GetIntegerv, GL_NUM_EXTENSIONS, &count);
    std::string names;
    for (GLint i = 0; i < count; ++i) {
        GLubyte const *const text =
            tableExt_->glGetStringi ? tableExt_->glGetStringi(GL_EXTENSIONS, static_cast<GLuint>(i))
                                    : nullptr;
        std::string const name = text ? reinterpret_cast<char const *>(text) : "";
        ORU_ASSERT_TEXT("!anExtensionString.empty()", !name.empty());
        if (i > 0)
            names += ' ';
        names += name;
    }
    return names;
}

void ExtensionManager::TokenizeExtensionString(std::string const &text,
                                               std::vector<std::string> &out) {
    Tokenize(text, " ", out);
}

bool ExtensionManager::loadGroup(std::size_t first, std::size_t count) {
    // The table is nothing but pointers in catalogue order, as the prototype checks assert.
    char *const entries = reinterpret_cast<char *>(tableExt_.get());
    bool all = true;
    for (std::size_t i = first; i < first + count; ++i) {
        PROC const address = ::wglGetProcAddress(kEntryPointNames[i]);
        std::memcpy(entries + i * sizeof address, &address, sizeof address);
        all = all && address;
    }
    return all;
}

OpenGLExtension ExtensionManager::nameToEnumGL(char const *name) {
    return FindExtension(kGLExtensions, name);
}

std::string ExtensionManager::ExtensionEnumToString(OpenGLExtension e) {
    for (NamedExtension const &extension : kGLExtensions)
        if (extension.value == e)
            return extension.name;
    for (NamedExtension const &extension : kWGLExtensions)
        if (extension.value == e)
            return extension.name;
    return std::string();
}

bool ExtensionManager::isReported(OpenGLExtension e) const {
    std::string const name = ExtensionEnumToString(e);
    if (FindExtension(kWGLExtensions, name.c_str()) == e)
        return Contains(WGLExtensionNames(), name);
    bool reached = false;
    for (Rung const &rung : kLadder) {
        reached = reached || (majorVersion_ == rung.major && minorVersion_ == rung.minor);
        if (!reached)
            continue;
        // The climb passes over what a version brings that is not there itself.
        bool const brings = std::count(rung.extensions.begin(), rung.extensions.end(), e) > 0;
        if (rung.version == e || (brings && isSupported(rung.version)))
            return true;
    }
    return Contains(supportedNames_, name);
}

std::vector<std::string> ExtensionManager::missingEntryPoints(OpenGLExtension e) const {
    std::vector<std::string> missing;
    auto const *const entries = reinterpret_cast<char const *>(&table());
    for (std::size_t i = 0; i < std::size(kEntryPointGroups); ++i) {
        PROC address = nullptr;
        std::memcpy(&address, entries + i * sizeof address, sizeof address);
        if (kEntryPointGroups[i] == e && !address)
            missing.emplace_back(kEntryPointNames[i]);
    }
#define ORU_WGL_ROW(Extension, Name, Pointer, Line)                                                \
    if (e == Extension && !Pointer)                                                                \
        missing.emplace_back(#Name);
#include "oru/oru_ogl/extensionator/wgl/internal/extensionswgl_rows.inc"
    return missing;
}

bool ExtensionManager::initializeGL(OpenGLExtension e) {
    // A WGL capability has no loader here.
    return e < UNKNOWN_OPENGL_EXTENSION && sGroupLoaders_[e] && (this->*sGroupLoaders_[e])();
}

bool ExtensionManager::initialize(OpenGLExtension e) {
    if (isSupported(e))
        return true;
    if (!initializeGL(e) && !InitializeWGLExtension(e))
        return false;
    noteSupported(e);
    return true;
}

void ExtensionManager::tryInitializing(OpenGLExtension e, bool required) {
    if (!initialize(e) && required)
        ORU_THROW_INTERNAL("Attempted initialization of a required extension failed");
}

FunctionTable const &ExtensionManager::table() const {
    ORU_ASSERT_TEXT("tableExt_.get() != 0", tableExt_);
    return *tableExt_;
}

unsigned int ExtensionManager::releaseVersion() const {
    ORU_ASSERT(releaseVersion_ != -1);
    return static_cast<unsigned int>(releaseVersion_);
}

std::string ExtensionManager::vendorString() const {
    switch (vendor_) {
    case VENDOR_AMD:
        return "AMD";
    case VENDOR_NVIDIA:
        return "NVIDIA";
    case VENDOR_INTEL:
        return "INTEL";
    default:
        return "OTHER";
    }
}

bool ExtensionManager::supportsClampToEdge() const {
    return isSupported(GL_VERSION_1_2);
}

bool ExtensionManager::supportsTexture3D() const {
    return isSupported(GL_VERSION_1_2) || isSupported(GL_EXT_TEXTURE3D);
}

bool ExtensionManager::supportsMultiTexture() const {
    return isSupported(GL_VERSION_1_3) || isSupported(GL_ARB_MULTITEXTURE);
}

bool ExtensionManager::supportsDrawBuffers() const {
    return isSupported(GL_VERSION_2_0) || isSupported(GL_ARB_DRAW_BUFFERS);
}

bool ExtensionManager::supportsFloatingPointTextures() const {
    return isSupported(GL_ARB_TEXTURE_FLOAT) || isSupported(GL_ATI_TEXTURE_FLOAT) ||
           isSupported(GL_APPLE_FLOAT_PIXELS);
}

bool ExtensionManager::supports16BitFloat() const {
    return isSupported(GL_ARB_HALF_FLOAT_PIXEL) || isSupported(GL_APPLE_FLOAT_PIXELS);
}

bool ExtensionManager::supportsPixelBuffers() const {
    return isSupported(WGL_ARB_PIXEL_FORMAT) && isSupported(WGL_ARB_PBUFFER);
}

bool ExtensionManager::supportsRenderToTexture() const {
    return isSupported(WGL_ARB_RENDER_TEXTURE);
}

bool ExtensionManager::supportsRenderToTextureRectangle() const {
    return isSupported(WGL_NV_RENDER_TEXTURE_RECTANGLE);
}

bool ExtensionManager::testFloatFiltering() {
    return isSupported(WGL_ARB_RENDER_TEXTURE) && internal::FiltersFloatsLinearly();
}

bool ExtensionManager::testHalfFiltering() {
    return isSupported(WGL_ARB_RENDER_TEXTURE) && internal::FiltersHalvesLinearly();
}

bool ExtensionManager::supportsFloatFiltering() {
    if (!floatFiltering_.isKnown) {
        floatFiltering_.value =
            supportsFloatingPointTextures() && Passes([this] { return testFloatFiltering(); });
        floatFiltering_.isKnown = true;
    }
    return floatFiltering_.value;
}

bool ExtensionManager::supportsHalfFiltering() {
    if (!isSupported(GL_EXT_GPU_SHADER4))
        return false;
    if (!halfFiltering_.isKnown) {
        halfFiltering_.value =
            supports16BitFloat() && Passes([this] { return testHalfFiltering(); });
        halfFiltering_.isKnown = true;
    }
    return halfFiltering_.value;
}

unsigned int ExtensionManager::numberOfTextureUnits() const {
    GLint units = 1;
    // A core context has the units of shaders only.
    if (isSupported(GL_ARB_FRAGMENT_PROGRAM) || internal::IsCoreContext())
        ORU_GL(GetIntegerv, GL_MAX_TEXTURE_IMAGE_UNITS, &units);
    else if (supportsMultiTexture())
        ORU_GL(GetIntegerv, GL_MAX_TEXTURE_UNITS, &units);
    return static_cast<unsigned int>(units);
}

std::ostream &operator<<(std::ostream &os, ExtensionManager const &m) {
    os << "ExtensionManager for context version " << m.majorVersion() << "." << m.minorVersion()
       << "\n"
       << "                        glsl version " << m.glslMajorVersion() << "."
       << m.glslMinorVersion() << "\n"
       << "Supported extensions:\n";
    for (std::string const &name : m.supportedExtensionNames())
        os << "    " << name << "\n";
    if (m.supportedExtensionNames().empty())
        os << "    NONE\n";
    return os;
}

} // namespace ORU::OGL
