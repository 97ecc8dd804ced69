// The OpenGL side of sharing by copying.
#include "tests/support/oclruntime/glcopies.h"

#include <algorithm>
#include <cmath>

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

constexpr SharedFormat formats[] = {
    {GL_RGBA8, GL_RGBA, GL_UNSIGNED_BYTE, {CL_RGBA, CL_UNORM_INT8}, 4},
    {GL_RGBA16, GL_RGBA, GL_UNSIGNED_SHORT, {CL_RGBA, CL_UNORM_INT16}, 8},
    {GL_RGBA16F, GL_RGBA, GL_HALF_FLOAT, {CL_RGBA, CL_HALF_FLOAT}, 8},
    {GL_RGBA32F, GL_RGBA, GL_FLOAT, {CL_RGBA, CL_FLOAT}, 16},
    {GL_R32F, GL_RED, GL_FLOAT, {CL_R, CL_FLOAT}, 4},
};

SharedFormat const *FormatOf(std::size_t internalFormat) {
    for (SharedFormat const &format : formats)
        if (format.internalFormat == internalFormat)
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

/// The query for what is bound to a texture target.
GLenum TextureBinding(GLenum target) {
    if (target == GL_TEXTURE_3D)
        return GL_TEXTURE_BINDING_3D;
    return target == GL_TEXTURE_2D ? GL_TEXTURE_BINDING_2D : GL_TEXTURE_BINDING_RECTANGLE;
}

/// Pixels lie densely in memory, for a scope.
class DensePixels {
public:
    explicit DensePixels(Functions const &gl) {
        glPushClientAttrib(GL_CLIENT_PIXEL_STORE_BIT); // the bound buffers, too
        gl.BindBuffer(GL_PIXEL_PACK_BUFFER, 0);
        gl.BindBuffer(GL_PIXEL_UNPACK_BUFFER, 0);
        constexpr GLenum stores[] = {
            GL_PACK_ROW_LENGTH,    GL_PACK_SKIP_PIXELS,    GL_PACK_SKIP_ROWS,
            GL_PACK_SKIP_IMAGES,   GL_PACK_IMAGE_HEIGHT,   GL_PACK_SWAP_BYTES,
            GL_UNPACK_ROW_LENGTH,  GL_UNPACK_SKIP_PIXELS,  GL_UNPACK_SKIP_ROWS,
            GL_UNPACK_SKIP_IMAGES, GL_UNPACK_IMAGE_HEIGHT, GL_UNPACK_SWAP_BYTES};
        for (GLenum const store : stores)
            glPixelStorei(store, 0);
        glPixelStorei(GL_PACK_ALIGNMENT, 1);
        glPixelStorei(GL_UNPACK_ALIGNMENT, 1);
    }
    ~DensePixels() { glPopClientAttrib(); }
    DensePixels(DensePixels const &) = delete;
    DensePixels &operator=(DensePixels const &) = delete;
};

/// Does `work` with a framebuffer of our own bound to `target`.
template<class Work>
void InFramebuffer(Functions const &gl, GLenum target, GLenum query, Work work) {
    GLuint name = 0;
    gl.GenFramebuffers(1, &name);
    {
        Bound const bound(gl.BindFramebuffer, target, query, name);
        work();
    }
    gl.DeleteFramebuffers(1, &name);
}

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
    auto const get = [&object](GLenum query) {
        GLint value = 0;
        glGetTexLevelParameteriv(object.target, object.level, query, &value);
        return static_cast<std::size_t>(value);
    };
    object.width = get(GL_TEXTURE_WIDTH);
    object.height = get(GL_TEXTURE_HEIGHT);
    object.depth = object.target == GL_TEXTURE_3D ? get(GL_TEXTURE_DEPTH) : 1;
    if (object.width == 0 || object.height == 0)
        return CL_INVALID_GL_OBJECT;
    object.format = FormatOf(get(GL_TEXTURE_INTERNAL_FORMAT));
    return object.format ? CL_SUCCESS : CL_INVALID_IMAGE_FORMAT_DESCRIPTOR;
}

cl_int DescribeRenderbuffer(Functions const &gl, GLObject &object) {
    if (!gl.IsRenderbuffer(object.name))
        return CL_INVALID_GL_OBJECT;
    Bound const bound(gl.BindRenderbuffer, GL_RENDERBUFFER, GL_RENDERBUFFER_BINDING, object.name);
    auto const get = [&gl](GLenum query) {
        GLint value = 0;
        gl.GetRenderbufferParameteriv(GL_RENDERBUFFER, query, &value);
        return static_cast<std::size_t>(value);
    };
    object.width = get(GL_RENDERBUFFER_WIDTH);
    object.height = get(GL_RENDERBUFFER_HEIGHT);
    if (object.width == 0 || object.height == 0)
        return CL_INVALID_GL_OBJECT;
    if (get(GL_RENDERBUFFER_SAMPLES) > 0)
        return CL_INVALID_OPERATION;
    object.format = FormatOf(get(GL_RENDERBUFFER_INTERNAL_FORMAT));
    return object.format ? CL_SUCCESS : CL_INVALID_IMAGE_FORMAT_DESCRIPTOR;
}

void ReadRenderbuffer(Functions const &gl, GLObject const &object, void *pixels) {
    InFramebuffer(gl, GL_READ_FRAMEBUFFER, GL_READ_FRAMEBUFFER_BINDING, [&] {
        gl.FramebufferRenderbuffer(GL_READ_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_RENDERBUFFER,
                                   object.name);
        glReadBuffer(GL_COLOR_ATTACHMENT0);
        glReadPixels(0, 0, static_cast<GLsizei>(object.width), static_cast<GLsizei>(object.height),
                     object.format->format, object.format->type, pixels);
    });
}

/// Through a texture, since only rendering and blitting write to a renderbuffer.
void WriteRenderbuffer(Functions const &gl, GLObject const &object, void *pixels) {
    auto const width = static_cast<GLsizei>(object.width);
    auto const height = static_cast<GLsizei>(object.height);
    auto const blit = [&] {
        gl.FramebufferRenderbuffer(GL_DRAW_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_RENDERBUFFER,
                                   object.name);
        glPushAttrib(GL_SCISSOR_BIT);
        glDisable(GL_SCISSOR_TEST);
        gl.BlitFramebuffer(0, 0, width, height, 0, 0, width, height, GL_COLOR_BUFFER_BIT,
                           GL_NEAREST);
        glPopAttrib();
    };
    GLuint texture = 0;
    glGenTextures(1, &texture);
    InFramebuffer(gl, GL_READ_FRAMEBUFFER, GL_READ_FRAMEBUFFER_BINDING, [&] {
        BoundTexture const bound(bindTexture, GL_TEXTURE_2D, GL_TEXTURE_BINDING_2D, texture);
        glTexImage2D(GL_TEXTURE_2D, 0, static_cast<GLint>(object.format->internalFormat), width,
                     height, 0, object.format->format, object.format->type, pixels);
        gl.FramebufferTexture2D(GL_READ_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, texture,
                                0);
        InFramebuffer(gl, GL_DRAW_FRAMEBUFFER, GL_DRAW_FRAMEBUFFER_BINDING, blit);
    });
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

void CopyGL(GLObject const &object, std::vector<unsigned char> &pixels, bool toOpenGL) {
    Functions const gl;
    DensePixels const dense(gl);
    auto const width = static_cast<GLsizei>(object.width);
    auto const height = static_cast<GLsizei>(object.height);
    if (object.kind == CL_GL_OBJECT_BUFFER) {
        Bound const bound(gl.BindBuffer, GL_COPY_READ_BUFFER, GL_COPY_READ_BUFFER_BINDING,
                          object.name);
        if (toOpenGL)
            gl.BufferSubData(GL_COPY_READ_BUFFER, 0, width, pixels.data());
        else
            gl.GetBufferSubData(GL_COPY_READ_BUFFER, 0, width, pixels.data());
    } else if (object.kind == CL_GL_OBJECT_RENDERBUFFER) {
        (toOpenGL ? WriteRenderbuffer : ReadRenderbuffer)(gl, object, pixels.data());
    } else {
        BoundTexture const bound(bindTexture, object.target, TextureBinding(object.target),
                                 object.name);
        SharedFormat const &format = *object.format;
        if (!toOpenGL)
            glGetTexImage(object.target, object.level, format.format, format.type, pixels.data());
        else if (object.target == GL_TEXTURE_3D)
            gl.TexSubImage3D(object.target, object.level, 0, 0, 0, width, height,
                             static_cast<GLsizei>(object.depth), format.format, format.type,
                             pixels.data());
        else
            glTexSubImage2D(object.target, object.level, 0, 0, width, height, format.format,
                            format.type, pixels.data());
    }
}

} // namespace oru_test::runtime
