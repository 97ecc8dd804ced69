// The OpenGL side of sharing by copying.
#include "glcopies.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>

#include <GL/gl.h>

#include <GL/glext.h>

namespace oru_test::runtime {

namespace {

/// The entry points beyond OpenGL 1.1, as the current context has them.
struct Functions {
#define ORU_GL_FUNCTION(Type, Name)                                                                \
    Type Name = reinterpret_cast<Type>(reinterpret_cast<void *>(wglGetProcAddress("gl" #Name)));
    ORU_GL_FUNCTION(PFNGLBINDBUFFERPROC, BindBuffer)
    ORU_GL_FUNCTION(PFNGLISBUFFERPROC, IsBuffer)
    ORU_GL_FUNCTION(PFNGLBUFFERSUBDATAPROC, BufferSubData)
    ORU_GL_FUNCTION(PFNGLGETBUFFERSUBDATAPROC, GetBufferSubData)
    ORU_GL_FUNCTION(PFNGLGETBUFFERPARAMETERIVPROC, GetBufferParameteriv)
    ORU_GL_FUNCTION(PFNGLTEXSUBIMAGE3DPROC, TexSubImage3D)
    ORU_GL_FUNCTION(PFNGLISRENDERBUFFERPROC, IsRenderbuffer)
    ORU_GL_FUNCTION(PFNGLBINDRENDERBUFFERPROC, BindRenderbuffer)
    ORU_GL_FUNCTION(PFNGLGETRENDERBUFFERPARAMETERIVPROC, GetRenderbufferParameteriv)
    ORU_GL_FUNCTION(PFNGLGENFRAMEBUFFERSPROC, GenFramebuffers)
    ORU_GL_FUNCTION(PFNGLDELETEFRAMEBUFFERSPROC, DeleteFramebuffers)
    ORU_GL_FUNCTION(PFNGLBINDFRAMEBUFFERPROC, BindFramebuffer)
    ORU_GL_FUNCTION(PFNGLFRAMEBUFFERRENDERBUFFERPROC, FramebufferRenderbuffer)
    ORU_GL_FUNCTION(PFNGLFRAMEBUFFERTEXTURE2DPROC, FramebufferTexture2D)
    ORU_GL_FUNCTION(PFNGLBLITFRAMEBUFFERPROC, BlitFramebuffer)
#undef ORU_GL_FUNCTION
};

// One row for each of the channel orders that the extension lists for a component type.
#define ORU_SHARED_FORMATS(Suffix, Type, ClType, R, RG, RGBA, Bytes)                               \
    {GL_R##Suffix, R, Type, {CL_R, ClType}, Bytes},                                                \
        {GL_RG##Suffix, RG, Type, {CL_RG, ClType}, 2 * std::size_t(Bytes)},                        \
        {GL_RGBA##Suffix, RGBA, Type, {CL_RGBA, ClType}, 4 * std::size_t(Bytes)},

#define ORU_SHARED_FIXED(Suffix, Type, ClType, Bytes)                                              \
    ORU_SHARED_FORMATS(Suffix, Type, ClType, GL_RED, GL_RG, GL_RGBA, Bytes)
#define ORU_SHARED_INTEGER(Suffix, Type, ClType, Bytes)                                            \
    ORU_SHARED_FORMATS(Suffix, Type, ClType, GL_RED_INTEGER, GL_RG_INTEGER, GL_RGBA_INTEGER, Bytes)

constexpr SharedFormat formats[] = {
    ORU_SHARED_FIXED(8, GL_UNSIGNED_BYTE, CL_UNORM_INT8,
                     1) ORU_SHARED_FIXED(16, GL_UNSIGNED_SHORT, CL_UNORM_INT16,
                                         2) ORU_SHARED_FIXED(8_SNORM, GL_BYTE, CL_SNORM_INT8, 1)
        ORU_SHARED_FIXED(16_SNORM, GL_SHORT, CL_SNORM_INT16, 2) ORU_SHARED_FIXED(
            16F, GL_HALF_FLOAT, CL_HALF_FLOAT, 2) ORU_SHARED_FIXED(32F, GL_FLOAT, CL_FLOAT, 4)
            ORU_SHARED_INTEGER(8I, GL_BYTE, CL_SIGNED_INT8, 1)
                ORU_SHARED_INTEGER(16I, GL_SHORT, CL_SIGNED_INT16, 2)
                    ORU_SHARED_INTEGER(32I, GL_INT, CL_SIGNED_INT32, 4)
                        ORU_SHARED_INTEGER(8UI, GL_UNSIGNED_BYTE, CL_UNSIGNED_INT8, 1)
                            ORU_SHARED_INTEGER(16UI, GL_UNSIGNED_SHORT, CL_UNSIGNED_INT16, 2)
                                ORU_SHARED_INTEGER(32UI, GL_UNSIGNED_INT, CL_UNSIGNED_INT32, 4)};

SharedFormat const *FormatOf(int internalFormat) {
    for (SharedFormat const &format : formats)
        if (format.internalFormat == static_cast<unsigned int>(internalFormat))
            return &format;
    return nullptr;
}

GLint GetInteger(GLenum query) {
    GLint value = 0;
    glGetIntegerv(query, &value);
    return value;
}

/// Binds for a scope, by a function of (target, name).
template<class Bind>
class Bound {
public:
    Bound(Bind bind, GLenum target, GLenum query, unsigned int name)
        : bind_(bind), target_(target), previous_(static_cast<GLuint>(GetInteger(query))) {
        bind_(target_, name);
    }
    ~Bound() { bind_(target_, previous_); }
    Bound(Bound const &) = delete;
    Bound &operator=(Bound const &) = delete;

private:
    Bind bind_;
    GLenum target_;
    GLuint previous_;
};

GLenum TextureBinding(GLenum target) {
    switch (target) {
    case GL_TEXTURE_2D:
        return GL_TEXTURE_BINDING_2D;
    case GL_TEXTURE_3D:
        return GL_TEXTURE_BINDING_3D;
    default:
        return GL_TEXTURE_BINDING_RECTANGLE;
    }
}

/// Pixels lie densely in memory, for a scope.
class DensePixels {
public:
    explicit DensePixels(Functions const &gl)
        : pack_(gl.BindBuffer, GL_PIXEL_PACK_BUFFER, GL_PIXEL_PACK_BUFFER_BINDING, 0),
          unpack_(gl.BindBuffer, GL_PIXEL_UNPACK_BUFFER, GL_PIXEL_UNPACK_BUFFER_BINDING, 0) {
        for (std::size_t i = 0; i < stores.size(); ++i) {
            previous_[i] = GetInteger(stores[i]);
            bool const alignment =
                stores[i] == GL_PACK_ALIGNMENT || stores[i] == GL_UNPACK_ALIGNMENT;
            glPixelStorei(stores[i], alignment ? 1 : 0);
        }
    }
    ~DensePixels() {
        for (std::size_t i = 0; i < stores.size(); ++i)
            glPixelStorei(stores[i], previous_[i]);
    }
    DensePixels(DensePixels const &) = delete;
    DensePixels &operator=(DensePixels const &) = delete;

private:
    static constexpr std::array<GLenum, 14> stores = {
        GL_PACK_ALIGNMENT,      GL_PACK_ROW_LENGTH,    GL_PACK_SKIP_PIXELS, GL_PACK_SKIP_ROWS,
        GL_PACK_SKIP_IMAGES,    GL_PACK_IMAGE_HEIGHT,  GL_PACK_SWAP_BYTES,  GL_UNPACK_ALIGNMENT,
        GL_UNPACK_ROW_LENGTH,   GL_UNPACK_SKIP_PIXELS, GL_UNPACK_SKIP_ROWS, GL_UNPACK_SKIP_IMAGES,
        GL_UNPACK_IMAGE_HEIGHT, GL_UNPACK_SWAP_BYTES};

    Bound<PFNGLBINDBUFFERPROC> pack_, unpack_;
    std::array<GLint, stores.size()> previous_;
};

/// A framebuffer of our own, bound to `target` for a scope.
class Framebuffer {
public:
    Framebuffer(Functions const &gl, GLenum target, GLenum query)
        : gl_(gl), name_(Generate(gl)), bound_(gl.BindFramebuffer, target, query, name_) {}
    ~Framebuffer() { gl_.DeleteFramebuffers(1, &name_); }
    Framebuffer(Framebuffer const &) = delete;
    Framebuffer &operator=(Framebuffer const &) = delete;

private:
    static GLuint Generate(Functions const &gl) {
        GLuint name = 0;
        gl.GenFramebuffers(1, &name);
        return name;
    }

    Functions const &gl_;
    GLuint name_;
    Bound<PFNGLBINDFRAMEBUFFERPROC> bound_;
};

auto const bindTexture = [](GLenum target, GLuint name) { glBindTexture(target, name); };
using BoundTexture = Bound<decltype(bindTexture)>;

cl_int DescribeBuffer(Functions const &gl, GLObject &object) {
    if (!gl.IsBuffer(object.name))
        return CL_INVALID_GL_OBJECT;
    Bound const bound(gl.BindBuffer, GL_COPY_READ_BUFFER, GL_COPY_READ_BUFFER_BINDING, object.name);
    GLint size = 0;
    gl.GetBufferParameteriv(GL_COPY_READ_BUFFER, GL_BUFFER_SIZE, &size);
    object.width = static_cast<std::size_t>(size);
    return size > 0 ? CL_SUCCESS : CL_INVALID_GL_OBJECT;
}

/// The last level that the texture bound to `target` may have.
GLint LastLevel(GLenum target) {
    if (target == GL_TEXTURE_RECTANGLE)
        return 0;
    GLint base = 0, last = 0, size = 0, largest = 1;
    glGetTexParameteriv(target, GL_TEXTURE_BASE_LEVEL, &base);
    glGetTexParameteriv(target, GL_TEXTURE_MAX_LEVEL, &last);
    constexpr GLenum queries[] = {GL_TEXTURE_WIDTH, GL_TEXTURE_HEIGHT, GL_TEXTURE_DEPTH};
    for (GLenum const query : queries) {
        glGetTexLevelParameteriv(target, base, query, &size);
        largest = std::max(largest, size);
    }
    return std::min(last, base + static_cast<GLint>(std::log2(largest)));
}

cl_int DescribeTexture(GLObject &object) {
    if (!glIsTexture(object.name))
        return CL_INVALID_GL_OBJECT;
    BoundTexture const bound(bindTexture, object.target, TextureBinding(object.target),
                             object.name);
    // A texture that was made for another target is not bound.
    if (glGetError() != GL_NO_ERROR)
        return CL_INVALID_GL_OBJECT;
    if (object.level < 0 || object.level > LastLevel(object.target))
        return CL_INVALID_MIP_LEVEL;
    GLint size[3] = {}, internalFormat = 0;
    glGetTexLevelParameteriv(object.target, object.level, GL_TEXTURE_WIDTH, &size[0]);
    glGetTexLevelParameteriv(object.target, object.level, GL_TEXTURE_HEIGHT, &size[1]);
    glGetTexLevelParameteriv(object.target, object.level, GL_TEXTURE_DEPTH, &size[2]);
    glGetTexLevelParameteriv(object.target, object.level, GL_TEXTURE_INTERNAL_FORMAT,
                             &internalFormat);
    if (size[0] == 0 || size[1] == 0)
        return CL_INVALID_GL_OBJECT;
    object.width = static_cast<std::size_t>(size[0]);
    object.height = static_cast<std::size_t>(size[1]);
    object.depth = object.target == GL_TEXTURE_3D ? static_cast<std::size_t>(size[2]) : 1;
    object.format = FormatOf(internalFormat);
    return object.format ? CL_SUCCESS : CL_INVALID_IMAGE_FORMAT_DESCRIPTOR;
}

cl_int DescribeRenderbuffer(Functions const &gl, GLObject &object) {
    if (!gl.IsRenderbuffer(object.name))
        return CL_INVALID_GL_OBJECT;
    Bound const bound(gl.BindRenderbuffer, GL_RENDERBUFFER, GL_RENDERBUFFER_BINDING, object.name);
    auto const get = [&gl](GLenum query) {
        GLint value = 0;
        gl.GetRenderbufferParameteriv(GL_RENDERBUFFER, query, &value);
        return value;
    };
    object.width = static_cast<std::size_t>(get(GL_RENDERBUFFER_WIDTH));
    object.height = static_cast<std::size_t>(get(GL_RENDERBUFFER_HEIGHT));
    if (object.width == 0 || object.height == 0)
        return CL_INVALID_GL_OBJECT;
    if (get(GL_RENDERBUFFER_SAMPLES) > 0)
        return CL_INVALID_OPERATION;
    object.format = FormatOf(get(GL_RENDERBUFFER_INTERNAL_FORMAT));
    return object.format ? CL_SUCCESS : CL_INVALID_IMAGE_FORMAT_DESCRIPTOR;
}

void ReadRenderbuffer(Functions const &gl, GLObject const &object, unsigned char *pixels) {
    Framebuffer const source(gl, GL_READ_FRAMEBUFFER, GL_READ_FRAMEBUFFER_BINDING);
    gl.FramebufferRenderbuffer(GL_READ_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_RENDERBUFFER,
                               object.name);
    glReadBuffer(GL_COLOR_ATTACHMENT0);
    glReadPixels(0, 0, static_cast<GLsizei>(object.width), static_cast<GLsizei>(object.height),
                 object.format->format, object.format->type, pixels);
}

/// Through a texture, since only rendering and blitting write to a renderbuffer.
void WriteRenderbuffer(Functions const &gl, GLObject const &object, unsigned char const *pixels) {
    auto const width = static_cast<GLsizei>(object.width);
    auto const height = static_cast<GLsizei>(object.height);
    GLuint texture = 0;
    glGenTextures(1, &texture);
    {
        BoundTexture const bound(bindTexture, GL_TEXTURE_2D, GL_TEXTURE_BINDING_2D, texture);
        glTexImage2D(GL_TEXTURE_2D, 0, static_cast<GLint>(object.format->internalFormat), width,
                     height, 0, object.format->format, object.format->type, pixels);
        Framebuffer const source(gl, GL_READ_FRAMEBUFFER, GL_READ_FRAMEBUFFER_BINDING);
        gl.FramebufferTexture2D(GL_READ_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, texture,
                                0);
        Framebuffer const target(gl, GL_DRAW_FRAMEBUFFER, GL_DRAW_FRAMEBUFFER_BINDING);
        gl.FramebufferRenderbuffer(GL_DRAW_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_RENDERBUFFER,
                                   object.name);
        GLboolean const scissor = glIsEnabled(GL_SCISSOR_TEST);
        glDisable(GL_SCISSOR_TEST);
        gl.BlitFramebuffer(0, 0, width, height, 0, 0, width, height, GL_COLOR_BUFFER_BIT,
                           GL_NEAREST);
        if (scissor)
            glEnable(GL_SCISSOR_TEST);
    }
    glDeleteTextures(1, &texture);
}

} // namespace

CurrentGL::CurrentGL(HDC dc, HGLRC context)
    : previousDC_(wglGetCurrentDC()), previousContext_(wglGetCurrentContext()) {
    if (previousContext_ == context) {
        current_ = true;
    } else {
        current_ = switched_ = wglMakeCurrent(dc, context);
    }
}

CurrentGL::~CurrentGL() {
    if (switched_)
        wglMakeCurrent(previousDC_, previousContext_);
}

cl_int Describe(GLObject &object) {
    while (glGetError() != GL_NO_ERROR) {
        // Left by the caller; what comes now is ours.
    }
    Functions const gl;
    switch (object.kind) {
    case CL_GL_OBJECT_BUFFER:
        return DescribeBuffer(gl, object);
    case CL_GL_OBJECT_RENDERBUFFER:
        return DescribeRenderbuffer(gl, object);
    default:
        return DescribeTexture(object);
    }
}

void ReadGL(GLObject const &object, std::vector<unsigned char> &pixels) {
    Functions const gl;
    DensePixels const dense(gl);
    pixels.resize(object.bytes());
    if (object.kind == CL_GL_OBJECT_BUFFER) {
        Bound const bound(gl.BindBuffer, GL_COPY_READ_BUFFER, GL_COPY_READ_BUFFER_BINDING,
                          object.name);
        gl.GetBufferSubData(GL_COPY_READ_BUFFER, 0, static_cast<GLsizeiptr>(object.width),
                            pixels.data());
    } else if (object.kind == CL_GL_OBJECT_RENDERBUFFER) {
        ReadRenderbuffer(gl, object, pixels.data());
    } else {
        BoundTexture const bound(bindTexture, object.target, TextureBinding(object.target),
                                 object.name);
        glGetTexImage(object.target, object.level, object.format->format, object.format->type,
                      pixels.data());
    }
}

void WriteGL(GLObject const &object, std::vector<unsigned char> const &pixels) {
    Functions const gl;
    DensePixels const dense(gl);
    auto const width = static_cast<GLsizei>(object.width);
    auto const height = static_cast<GLsizei>(object.height);
    if (object.kind == CL_GL_OBJECT_BUFFER) {
        Bound const bound(gl.BindBuffer, GL_COPY_READ_BUFFER, GL_COPY_READ_BUFFER_BINDING,
                          object.name);
        gl.BufferSubData(GL_COPY_READ_BUFFER, 0, static_cast<GLsizeiptr>(object.width),
                         pixels.data());
    } else if (object.kind == CL_GL_OBJECT_RENDERBUFFER) {
        WriteRenderbuffer(gl, object, pixels.data());
    } else {
        BoundTexture const bound(bindTexture, object.target, TextureBinding(object.target),
                                 object.name);
        if (object.target == GL_TEXTURE_3D)
            gl.TexSubImage3D(object.target, object.level, 0, 0, 0, width, height,
                             static_cast<GLsizei>(object.depth), object.format->format,
                             object.format->type, pixels.data());
        else
            glTexSubImage2D(object.target, object.level, 0, 0, width, height, object.format->format,
                            object.format->type, pixels.data());
    }
}

} // namespace oru_test::runtime
