// The WGL extension entry points, as process-wide pointers.
#include "oru/oru_ogl/extensionator/wgl/extensionswgl.h"

#include "oru/oru_ogl/extensionator/internal/catalogueogl.h"
#include "oru/oru_ogl/extensionator/internal/functioncast.h"
#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <iterator>
#include <type_traits>

namespace ORU::OGL {

#define ORU_WGL_POINTER(Result, Pointer, Parameters)                                               \
    Result(ORU_APIENTRY *Pointer) Parameters = nullptr;
#include "oru/oru_ogl/extensionator/wgl/extensionswgl_pointers.inc"

namespace {

/// Looks one entry point up and stores the answer, null or not.
template<class Pointer>
bool Load(Pointer &pointer, char const *name, unsigned int line) {
    pointer = internal::FunctionCast<Pointer>(
        WGLInterceptor::Instance()->wcgmGetProcAddress(__FILE__, line, name));
    return pointer != nullptr;
}

bool IsWGLExtension(OpenGLExtension extension) {
    return std::any_of(std::begin(kWGLExtensions), std::end(kWGLExtensions),
                       [extension](NamedExtension const &e) { return e.value == extension; });
}

} // namespace

bool InitializeWGLExtension(OpenGLExtension extension) {
    if (!IsWGLExtension(extension))
        return false;
    bool found = true;
#define ORU_WGL_ROW(Extension, Name, Pointer, Line)                                                \
    if (extension == Extension)                                                                    \
        found = Load(Pointer, #Name, Line) && found;
#include "oru/oru_ogl/extensionator/wgl/internal/extensionswgl_rows.inc"
    return found;
}

// The pointers' types against the platform header's.
#define ORU_WGL_TYPE(Pointer, Type) static_assert(std::is_same_v<decltype(Pointer), Type>, #Type);
#include "oru/oru_ogl/extensionator/wgl/internal/extensionswgl_types.inc"

} // namespace ORU::OGL
