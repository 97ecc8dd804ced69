// cl_khr_gl_sharing for WGL contexts: 2-D textures are copied when they are acquired and released.
#include "tests/support/oclruntime/runtime.h"

#include <map>
#include <mutex>
#include <vector>

#include <windows.h>

#include <GL/gl.h>

#include <GL/glext.h>

namespace oru_test::runtime {

namespace {

using ContextCallback = void(CL_CALLBACK *)(char const *, void const *, std::size_t, void *);

/// The entry points that take a texture's name, so that nothing needs binding.
struct NamedFunctions {
#define ORU_GL_FUNCTION(Type, Name)                                                                \
    Type Name = reinterpret_cast<Type>(reinterpret_cast<void *>(wglGetProcAddress("gl" #Name)));
    ORU_GL_FUNCTION(PFNGLGETTEXTURELEVELPARAMETERIVPROC, GetTextureLevelParameteriv)
    ORU_GL_FUNCTION(PFNGLGETTEXTUREIMAGEPROC, GetTextureImage)
    ORU_GL_FUNCTION(PFNGLTEXTURESUBIMAGE2DPROC, TextureSubImage2D)
#undef ORU_GL_FUNCTION
};

struct Format {
    GLint internalFormat;
    GLenum type; ///< of the channels in memory, RGBA
    cl_image_format image;
    std::size_t pixelSize; ///< bytes
};

constexpr Format formats[] = {
    {GL_RGBA8, GL_UNSIGNED_BYTE, {CL_RGBA, CL_UNORM_INT8}, 4},
    {GL_RGBA32F, GL_FLOAT, {CL_RGBA, CL_FLOAT}, 16},
};

/// A level of a 2-D texture.
struct Level {
    GLuint texture;
    GLint level;
    std::size_t width, height;
    Format format;
};

std::mutex mutex;
std::map<cl_mem, Level> levels;

/// The properties that the system knows.
std::vector<cl_context_properties> WithoutSharing(cl_context_properties const *properties) {
    std::vector<cl_context_properties> others;
    for (; *properties != 0; properties += 2)
        if (properties[0] != CL_WGL_HDC_KHR && properties[0] != CL_GL_CONTEXT_KHR)
            others.insert(others.end(), {properties[0], properties[1]});
    others.push_back(0);
    return others;
}

// Wine's opencl.dll takes no callback.
cl_context CL_API_CALL CreateContext(cl_context_properties const *properties, cl_uint count,
                                     cl_device_id const *devices, ContextCallback, void *,
                                     cl_int *error) {
    return System().clCreateContext(WithoutSharing(properties).data(), count, devices, nullptr,
                                    nullptr, error);
}

cl_context CL_API_CALL CreateContextFromType(cl_context_properties const *properties,
                                             cl_device_type type, ContextCallback, void *,
                                             cl_int *error) {
    return System().clCreateContextFromType(WithoutSharing(properties).data(), type, nullptr,
                                            nullptr, error);
}

/// What stands in for an object whose contents are not copied.
cl_mem CL_API_CALL CreateFromGL(cl_context context, cl_mem_flags flags, cl_GLuint, cl_int *error) {
    return System().clCreateBuffer(context, flags, 1, nullptr, error);
}

cl_mem CL_API_CALL CreateFromGLTexture(cl_context context, cl_mem_flags flags, cl_GLenum target,
                                       cl_GLint level, cl_GLuint name, cl_int *error) {
    if (target != GL_TEXTURE_2D)
        return CreateFromGL(context, flags, name, error);
    auto const get = [gl = NamedFunctions(), name, level](GLenum query) {
        GLint value = 0;
        gl.GetTextureLevelParameteriv(name, level, query, &value);
        return value;
    };
    for (Format const &format : formats) {
        if (format.internalFormat != get(GL_TEXTURE_INTERNAL_FORMAT))
            continue;
        auto const width = static_cast<std::size_t>(get(GL_TEXTURE_WIDTH));
        auto const height = static_cast<std::size_t>(get(GL_TEXTURE_HEIGHT));
        cl_mem const image = System().clCreateImage2D(context, flags, &format.image, width, height,
                                                      0, nullptr, error);
        std::lock_guard const lock(mutex);
        levels[image] = {name, level, width, height, format};
        return image;
    }
    return Refuse(error, CL_INVALID_IMAGE_FORMAT_DESCRIPTOR);
}

/// Copies between a level and the image that stands in for it, through the host.
template<bool ToOpenGL>
cl_int Copy(cl_command_queue queue, cl_mem image, Level const &level) {
    NamedFunctions const gl;
    std::vector<unsigned char> pixels(level.width * level.height * level.format.pixelSize);
    auto const width = static_cast<GLsizei>(level.width);
    auto const height = static_cast<GLsizei>(level.height);
    std::size_t const origin[3] = {}, region[3] = {level.width, level.height, 1};
    if (!ToOpenGL) {
        gl.GetTextureImage(level.texture, level.level, GL_RGBA, level.format.type,
                           static_cast<GLsizei>(pixels.size()), pixels.data());
        return System().clEnqueueWriteImage(queue, image, CL_TRUE, origin, region, 0, 0,
                                            pixels.data(), 0, nullptr, nullptr);
    }
    cl_int const error = System().clEnqueueReadImage(queue, image, CL_TRUE, origin, region, 0, 0,
                                                     pixels.data(), 0, nullptr, nullptr);
    gl.TextureSubImage2D(level.texture, level.level, 0, 0, width, height, GL_RGBA,
                         level.format.type, pixels.data());
    return error;
}

/// Acquires or releases; the mistakes of a caller are not looked for. Where no OpenGL context is
/// current, the handle is one that memory of OpenCL's own has got again.
template<bool ToOpenGL>
cl_int CL_API_CALL Transfer(cl_command_queue queue, cl_uint count, cl_mem const *objects,
                            cl_uint waitCount, cl_event const *waits, cl_event *event) {
    cl_int error = waitCount > 0 ? System().clWaitForEvents(waitCount, waits) : CL_SUCCESS;
    std::lock_guard const lock(mutex);
    for (cl_uint i = 0; wglGetCurrentContext() && i < count && error == CL_SUCCESS; ++i)
        if (auto const found = levels.find(objects[i]); found != levels.end())
            error = Copy<ToOpenGL>(queue, objects[i], found->second);
    return error == CL_SUCCESS ? System().clEnqueueMarker(queue, event) : error;
}

} // namespace

void ReplaceSharing(FunctionTable &table) {
    table.clCreateContext = CreateContext;
    table.clCreateContextFromType = CreateContextFromType;
    table.clCreateFromGLBuffer = CreateFromGL;
    table.clCreateFromGLRenderbuffer = CreateFromGL;
    table.clCreateFromGLTexture2D = CreateFromGLTexture;
    table.clCreateFromGLTexture3D = CreateFromGLTexture;
    table.clEnqueueAcquireGLObjects = Transfer<false>;
    table.clEnqueueReleaseGLObjects = Transfer<true>;
}

} // namespace oru_test::runtime
