// cl_khr_gl_sharing for WGL contexts, by copying when an object is acquired and released.
#include "tests/support/oclruntime/runtime.h"

#include <map>
#include <mutex>
#include <vector>

#include <windows.h>

#include <GL/gl.h>

#include <GL/glext.h>

namespace oru_test::runtime {

namespace {

constexpr cl_int invalidShareGroup = -1000; // CL_INVALID_GL_SHAREGROUP_REFERENCE_KHR

using ContextCallback = void(CL_CALLBACK *)(char const *, void const *, std::size_t, void *);

/// The entry points that take an object's name, so that nothing needs binding.
struct NamedFunctions {
#define ORU_GL_FUNCTION(Type, Name)                                                                \
    Type Name = reinterpret_cast<Type>(reinterpret_cast<void *>(wglGetProcAddress("gl" #Name)));
    ORU_GL_FUNCTION(PFNGLGETNAMEDBUFFERPARAMETERIVPROC, GetNamedBufferParameteriv)
    ORU_GL_FUNCTION(PFNGLGETNAMEDBUFFERSUBDATAPROC, GetNamedBufferSubData)
    ORU_GL_FUNCTION(PFNGLNAMEDBUFFERSUBDATAPROC, NamedBufferSubData)
    ORU_GL_FUNCTION(PFNGLGETTEXTURELEVELPARAMETERIVPROC, GetTextureLevelParameteriv)
    ORU_GL_FUNCTION(PFNGLGETTEXTUREIMAGEPROC, GetTextureImage)
    ORU_GL_FUNCTION(PFNGLTEXTURESUBIMAGE2DPROC, TextureSubImage2D)
#undef ORU_GL_FUNCTION
};

struct Format {
    GLint internalFormat;
    GLenum type; ///< of the channels in memory, RGBA
    cl_image_format image;
    GLsizei pixelSize; ///< bytes
};

constexpr Format formats[] = {
    {GL_RGBA8, GL_UNSIGNED_BYTE, {CL_RGBA, CL_UNORM_INT8}, 4},
    {GL_RGBA32F, GL_FLOAT, {CL_RGBA, CL_FLOAT}, 16},
};

/// An OpenGL buffer or a level of a 2-D texture.
struct Shared {
    GLuint name = 0;
    GLint level = 0;
    GLint width = 0, height = 1;    ///< pixels, or the bytes of a buffer
    Format const *format = nullptr; ///< null for a buffer

    std::size_t bytes() const {
        return static_cast<std::size_t>(width * height * (format ? format->pixelSize : 1));
    }
};

std::mutex mutex;
std::map<cl_mem, Shared> copied;

/// Creates a context by `create(properties)` without the properties that the system does not know.
template<class Create>
cl_context CreateSharing(cl_context_properties const *properties, ContextCallback notify,
                         void *userData, cl_int *error, Create create) {
    std::vector<cl_context_properties> others;
    auto dc = wglGetCurrentDC();
    auto context = wglGetCurrentContext();
    for (; *properties != 0; properties += 2)
        if (properties[0] == CL_WGL_HDC_KHR)
            dc = reinterpret_cast<HDC>(properties[1]);
        else if (properties[0] == CL_GL_CONTEXT_KHR)
            context = reinterpret_cast<HGLRC>(properties[1]);
        else
            others.insert(others.end(), {properties[0], properties[1]});
    others.push_back(0);
    if (dc == wglGetCurrentDC() && context == wglGetCurrentContext())
        return create(others.data());
    // Wine's opencl.dll takes no callback, so the only thing to call it for is ours.
    if (notify)
        notify("The OpenGL context is not current", nullptr, 0, userData);
    return Refuse(error, invalidShareGroup);
}

cl_context CL_API_CALL CreateContext(cl_context_properties const *properties, cl_uint count,
                                     cl_device_id const *devices, ContextCallback notify,
                                     void *userData, cl_int *error) {
    return CreateSharing(properties, notify, userData, error, [&](auto list) {
        return System().clCreateContext(list, count, devices, nullptr, nullptr, error);
    });
}

cl_context CL_API_CALL CreateContextFromType(cl_context_properties const *properties,
                                             cl_device_type type, ContextCallback notify,
                                             void *userData, cl_int *error) {
    return CreateSharing(properties, notify, userData, error, [&](auto list) {
        return System().clCreateContextFromType(list, type, nullptr, nullptr, error);
    });
}

cl_mem Remember(cl_mem memory, Shared const &shared) {
    std::lock_guard const lock(mutex);
    copied[memory] = shared;
    return memory;
}

cl_mem CL_API_CALL CreateFromGLBuffer(cl_context context, cl_mem_flags flags, cl_GLuint name,
                                      cl_int *error) {
    Shared shared{name};
    NamedFunctions().GetNamedBufferParameteriv(name, GL_BUFFER_SIZE, &shared.width);
    return Remember(System().clCreateBuffer(context, flags, shared.bytes(), nullptr, error),
                    shared);
}

/// What stands in for an object whose contents are not copied.
cl_mem CreateStandIn(cl_context context, cl_mem_flags flags, cl_int *error) {
    return System().clCreateBuffer(context, flags, 1, nullptr, error);
}

cl_mem CL_API_CALL CreateFromGLTexture(cl_context context, cl_mem_flags flags, cl_GLenum target,
                                       cl_GLint level, cl_GLuint name, cl_int *error) {
    if (target != GL_TEXTURE_2D)
        return CreateStandIn(context, flags, error);
    Shared shared{name, level};
    NamedFunctions const gl;
    GLint internalFormat = 0;
    gl.GetTextureLevelParameteriv(name, level, GL_TEXTURE_WIDTH, &shared.width);
    gl.GetTextureLevelParameteriv(name, level, GL_TEXTURE_HEIGHT, &shared.height);
    gl.GetTextureLevelParameteriv(name, level, GL_TEXTURE_INTERNAL_FORMAT, &internalFormat);
    for (Format const &format : formats)
        if (format.internalFormat == internalFormat)
            shared.format = &format;
    if (!shared.format)
        return Refuse(error, CL_INVALID_IMAGE_FORMAT_DESCRIPTOR);
    return Remember(System().clCreateImage2D(context, flags, &shared.format->image,
                                             static_cast<std::size_t>(shared.width),
                                             static_cast<std::size_t>(shared.height), 0, nullptr,
                                             error),
                    shared);
}

cl_mem CL_API_CALL CreateFromGLRenderbuffer(cl_context context, cl_mem_flags flags, cl_GLuint,
                                            cl_int *error) {
    return CreateStandIn(context, flags, error);
}

void ReadGL(Shared const &shared, std::vector<unsigned char> &bytes) {
    NamedFunctions const gl;
    auto const size = static_cast<GLsizei>(bytes.size());
    if (shared.format)
        gl.GetTextureImage(shared.name, shared.level, GL_RGBA, shared.format->type, size,
                           bytes.data());
    else
        gl.GetNamedBufferSubData(shared.name, 0, size, bytes.data());
}

void WriteGL(Shared const &shared, std::vector<unsigned char> const &bytes) {
    NamedFunctions const gl;
    if (shared.format)
        gl.TextureSubImage2D(shared.name, shared.level, 0, 0, shared.width, shared.height, GL_RGBA,
                             shared.format->type, bytes.data());
    else
        gl.NamedBufferSubData(shared.name, 0, shared.width, bytes.data());
}

/// Copies between an OpenGL object and the system's memory object, through the host.
cl_int Copy(cl_command_queue queue, cl_mem memory, Shared const &shared, bool toOpenGL) {
    std::vector<unsigned char> bytes(shared.bytes());
    std::size_t const origin[3] = {}, region[3] = {static_cast<std::size_t>(shared.width),
                                                   static_cast<std::size_t>(shared.height), 1};
    auto const &cl = System();
    if (!toOpenGL) {
        ReadGL(shared, bytes);
        return shared.format ? cl.clEnqueueWriteImage(queue, memory, CL_TRUE, origin, region, 0, 0,
                                                      bytes.data(), 0, nullptr, nullptr)
                             : cl.clEnqueueWriteBuffer(queue, memory, CL_TRUE, 0, bytes.size(),
                                                       bytes.data(), 0, nullptr, nullptr);
    }
    cl_int const error = shared.format
                             ? cl.clEnqueueReadImage(queue, memory, CL_TRUE, origin, region, 0, 0,
                                                     bytes.data(), 0, nullptr, nullptr)
                             : cl.clEnqueueReadBuffer(queue, memory, CL_TRUE, 0, bytes.size(),
                                                      bytes.data(), 0, nullptr, nullptr);
    if (error == CL_SUCCESS)
        WriteGL(shared, bytes);
    return error;
}

/// Acquires or releases; the mistakes of a caller are not looked for.
template<bool ToOpenGL>
cl_int CL_API_CALL Transfer(cl_command_queue queue, cl_uint count, cl_mem const *objects,
                            cl_uint waitCount, cl_event const *waits, cl_event *event) {
    cl_int error = waitCount > 0 ? System().clWaitForEvents(waitCount, waits) : CL_SUCCESS;
    std::lock_guard const lock(mutex);
    for (cl_uint i = 0; i < count && error == CL_SUCCESS; ++i)
        if (auto const found = copied.find(objects[i]); found != copied.end())
            error = Copy(queue, objects[i], found->second, ToOpenGL);
    return error == CL_SUCCESS ? System().clEnqueueMarker(queue, event) : error;
}

} // namespace

void ReplaceSharing(FunctionTable &table) {
    table.clCreateContext = CreateContext;
    table.clCreateContextFromType = CreateContextFromType;
    table.clCreateFromGLBuffer = CreateFromGLBuffer;
    table.clCreateFromGLTexture2D = CreateFromGLTexture;
    table.clCreateFromGLTexture3D = CreateFromGLTexture;
    table.clCreateFromGLRenderbuffer = CreateFromGLRenderbuffer;
    table.clEnqueueAcquireGLObjects = Transfer<false>;
    table.clEnqueueReleaseGLObjects = Transfer<true>;
}

} // namespace oru_test::runtime
