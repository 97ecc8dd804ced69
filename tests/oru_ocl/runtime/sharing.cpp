// cl_khr_gl_sharing for WGL contexts, by copying when an object is acquired and released.
#include "glcopies.h"
#include "runtime.h"

#include <map>
#include <mutex>
#include <set>

#include <GL/gl.h>

#include <GL/glext.h>

namespace oru_test::runtime {

namespace {

constexpr cl_int invalidShareGroup = -1000; // CL_INVALID_GL_SHAREGROUP_REFERENCE_KHR

using ContextCallback = void(CL_CALLBACK *)(char const *, void const *, std::size_t, void *);

struct SharingContext {
    HDC dc = nullptr;
    HGLRC context = nullptr;
    std::vector<cl_context_properties> properties; ///< as the caller gave them
};

struct SharedMemory {
    GLObject object;
    cl_context context = nullptr;
    bool acquired = false;
};

/// Everything that the runtime knows about sharing.
struct State {
    std::recursive_mutex mutex;
    std::map<cl_context, SharingContext> contexts;
    std::map<cl_mem, SharedMemory> memory;
    std::map<cl_kernel, std::map<cl_uint, cl_mem>> arguments;
    std::map<cl_event, cl_command_type> events;
};

State &TheState() {
    static State state;
    return state;
}

#define ORU_LOCKED_STATE(name)                                                                     \
    State &name = TheState();                                                                      \
    std::lock_guard const lock(name.mutex)

/// The caller's properties, and those of them that the system's runtime knows.
struct ParsedProperties {
    SharingContext sharing;
    std::vector<cl_context_properties> system;
};

ParsedProperties Parse(cl_context_properties const *properties) {
    ParsedProperties parsed;
    for (; properties && *properties; properties += 2) {
        parsed.sharing.properties.insert(parsed.sharing.properties.end(),
                                         {properties[0], properties[1]});
        if (properties[0] == CL_WGL_HDC_KHR)
            parsed.sharing.dc = reinterpret_cast<HDC>(properties[1]);
        else if (properties[0] == CL_GL_CONTEXT_KHR)
            parsed.sharing.context = reinterpret_cast<HGLRC>(properties[1]);
        else
            parsed.system.insert(parsed.system.end(), {properties[0], properties[1]});
    }
    parsed.sharing.properties.push_back(0);
    parsed.system.push_back(0);
    return parsed;
}

/// Creates a context by `create(properties, error)` of the system, and remembers what it shares.
template<class Create>
cl_context CreateSharing(cl_context_properties const *properties, ContextCallback notify,
                         void *userData, cl_int *error, Create create) {
    ParsedProperties parsed = Parse(properties);
    bool const shares = parsed.sharing.context != nullptr;
    if (shares && !CurrentGL(parsed.sharing.dc, parsed.sharing.context)) {
        // Wine's opencl.dll takes no callback, so the only thing to call it for is ours.
        if (notify)
            notify("The OpenGL context is gone or current on another thread", nullptr, 0, userData);
        return Refuse(error, invalidShareGroup);
    }
    cl_context const context = create(properties ? parsed.system.data() : nullptr, error);
    if (context && shares) {
        ORU_LOCKED_STATE(state);
        state.contexts[context] = parsed.sharing;
    }
    return context;
}

cl_context CL_API_CALL CreateContext(cl_context_properties const *properties, cl_uint count,
                                     cl_device_id const *devices, ContextCallback notify,
                                     void *userData, cl_int *error) {
    return CreateSharing(properties, notify, userData, error, [&](auto list, cl_int *result) {
        return System().clCreateContext(list, count, devices, nullptr, nullptr, result);
    });
}

cl_context CL_API_CALL CreateContextFromType(cl_context_properties const *properties,
                                             cl_device_type type, ContextCallback notify,
                                             void *userData, cl_int *error) {
    return CreateSharing(properties, notify, userData, error, [&](auto list, cl_int *result) {
        return System().clCreateContextFromType(list, type, nullptr, nullptr, result);
    });
}

cl_int CL_API_CALL GetContextInfo(cl_context context, cl_context_info query, std::size_t room,
                                  void *result, std::size_t *sizeReturned) {
    ORU_LOCKED_STATE(state);
    auto const found = state.contexts.find(context);
    if (found == state.contexts.end() || query != CL_CONTEXT_PROPERTIES)
        return System().clGetContextInfo(context, query, room, result, sizeReturned);
    auto const &properties = found->second.properties;
    return Answer(properties.data(), properties.size() * sizeof properties[0], room, result,
                  sizeReturned);
}

cl_int CL_API_CALL GetGLContextInfo(cl_context_properties const *properties,
                                    cl_gl_context_info query, std::size_t room, void *result,
                                    std::size_t *sizeReturned) {
    SharingContext const sharing = Parse(properties).sharing;
    if (!sharing.context || !CurrentGL(sharing.dc, sharing.context))
        return invalidShareGroup;
    if (query != CL_CURRENT_DEVICE_FOR_GL_CONTEXT_KHR && query != CL_DEVICES_FOR_GL_CONTEXT_KHR)
        return CL_INVALID_VALUE;
    cl_platform_id platform = nullptr;
    for (auto const *entry = properties; *entry; entry += 2)
        if (*entry == CL_CONTEXT_PLATFORM)
            platform = reinterpret_cast<cl_platform_id>(entry[1]);
    cl_device_id device = nullptr;
    if (cl_int const error =
            System().clGetDeviceIDs(platform, CL_DEVICE_TYPE_DEFAULT, 1, &device, nullptr))
        return error;
    return Answer(&device, sizeof device, room, result, sizeReturned);
}

/// The system's memory object that stands in for an OpenGL object.
cl_mem CreateStandIn(cl_context context, cl_mem_flags flags, GLObject const &object,
                     cl_int *error) {
    if (!object.format)
        return System().clCreateBuffer(context, flags, object.width, nullptr, error);
    if (!HasImages())
        return Refuse(error, CL_INVALID_OPERATION);
    cl_mem const image =
        object.kind == CL_GL_OBJECT_TEXTURE3D
            ? System().clCreateImage3D(context, flags, &object.format->image, object.width,
                                       object.height, object.depth, 0, 0, nullptr, error)
            : System().clCreateImage2D(context, flags, &object.format->image, object.width,
                                       object.height, 0, nullptr, error);
    if (!image && *error == CL_IMAGE_FORMAT_NOT_SUPPORTED)
        *error = CL_INVALID_IMAGE_FORMAT_DESCRIPTOR;
    return image;
}

cl_mem CreateShared(cl_context context, cl_mem_flags flags, GLObject object,
                    cl_int *errorReturned) {
    ORU_LOCKED_STATE(state);
    auto const sharing = state.contexts.find(context);
    if (sharing == state.contexts.end())
        return Refuse(errorReturned, CL_INVALID_CONTEXT);
    if (flags & ~cl_mem_flags(CL_MEM_READ_ONLY | CL_MEM_WRITE_ONLY | CL_MEM_READ_WRITE))
        return Refuse(errorReturned, CL_INVALID_VALUE);
    CurrentGL const current(sharing->second.dc, sharing->second.context);
    if (!current)
        return Refuse(errorReturned, CL_INVALID_GL_OBJECT);
    if (cl_int const error = Describe(object))
        return Refuse(errorReturned, error);
    cl_int error = CL_SUCCESS;
    cl_mem const memory = CreateStandIn(context, flags, object, &error);
    if (memory)
        state.memory[memory] = {object, context, false};
    if (errorReturned)
        *errorReturned = error;
    return memory;
}

cl_mem CreateFromTexture(cl_context context, cl_mem_flags flags, std::set<cl_GLenum> const &targets,
                         cl_gl_object_type kind, cl_GLenum target, cl_GLint level, cl_GLuint name,
                         cl_int *error) {
    if (targets.count(target) == 0)
        return Refuse(error, CL_INVALID_VALUE);
    GLObject object;
    object.kind = kind;
    object.name = name;
    object.target = target;
    object.level = level;
    return CreateShared(context, flags, object, error);
}

cl_mem CL_API_CALL CreateFromGLBuffer(cl_context context, cl_mem_flags flags, cl_GLuint name,
                                      cl_int *error) {
    GLObject object;
    object.kind = CL_GL_OBJECT_BUFFER;
    object.name = name;
    return CreateShared(context, flags, object, error);
}

cl_mem CL_API_CALL CreateFromGLRenderbuffer(cl_context context, cl_mem_flags flags, cl_GLuint name,
                                            cl_int *error) {
    GLObject object;
    object.kind = CL_GL_OBJECT_RENDERBUFFER;
    object.name = name;
    return CreateShared(context, flags, object, error);
}

cl_mem CL_API_CALL CreateFromGLTexture2D(cl_context context, cl_mem_flags flags, cl_GLenum target,
                                         cl_GLint level, cl_GLuint name, cl_int *error) {
    return CreateFromTexture(context, flags, {GL_TEXTURE_2D, GL_TEXTURE_RECTANGLE},
                             CL_GL_OBJECT_TEXTURE2D, target, level, name, error);
}

cl_mem CL_API_CALL CreateFromGLTexture3D(cl_context context, cl_mem_flags flags, cl_GLenum target,
                                         cl_GLint level, cl_GLuint name, cl_int *error) {
    return CreateFromTexture(context, flags, {GL_TEXTURE_3D}, CL_GL_OBJECT_TEXTURE3D, target, level,
                             name, error);
}

cl_int CL_API_CALL GetGLObjectInfo(cl_mem memory, cl_gl_object_type *kind, cl_GLuint *name) {
    ORU_LOCKED_STATE(state);
    auto const found = state.memory.find(memory);
    if (found == state.memory.end())
        return CL_INVALID_GL_OBJECT;
    if (kind)
        *kind = found->second.object.kind;
    if (name)
        *name = found->second.object.name;
    return CL_SUCCESS;
}

cl_int CL_API_CALL GetGLTextureInfo(cl_mem memory, cl_gl_texture_info query, std::size_t room,
                                    void *result, std::size_t *sizeReturned) {
    ORU_LOCKED_STATE(state);
    auto const found = state.memory.find(memory);
    if (found == state.memory.end() || found->second.object.target == 0)
        return CL_INVALID_GL_OBJECT;
    GLObject const &object = found->second.object;
    if (query == CL_GL_TEXTURE_TARGET)
        return Answer(&object.target, sizeof object.target, room, result, sizeReturned);
    if (query == CL_GL_MIPMAP_LEVEL)
        return Answer(&object.level, sizeof object.level, room, result, sizeReturned);
    return CL_INVALID_VALUE;
}

/// Copies between an OpenGL object and its stand-in, through the host.
cl_int Copy(cl_command_queue queue, cl_mem memory, GLObject const &object, bool toOpenGL) {
    std::vector<unsigned char> pixels(object.bytes());
    std::size_t const origin[3] = {}, region[3] = {object.width, object.height, object.depth};
    auto const &system = System();
    if (!toOpenGL) {
        ReadGL(object, pixels);
        return object.format ? system.clEnqueueWriteImage(queue, memory, CL_TRUE, origin, region, 0,
                                                          0, pixels.data(), 0, nullptr, nullptr)
                             : system.clEnqueueWriteBuffer(queue, memory, CL_TRUE, 0, pixels.size(),
                                                           pixels.data(), 0, nullptr, nullptr);
    }
    cl_int const error = object.format
                             ? system.clEnqueueReadImage(queue, memory, CL_TRUE, origin, region, 0,
                                                         0, pixels.data(), 0, nullptr, nullptr)
                             : system.clEnqueueReadBuffer(queue, memory, CL_TRUE, 0, pixels.size(),
                                                          pixels.data(), 0, nullptr, nullptr);
    if (error == CL_SUCCESS)
        WriteGL(object, pixels);
    return error;
}

/// Whether the objects of a command may be transferred now; CL_SUCCESS or the error.
cl_int CheckTransfer(State &state, cl_context context, cl_uint count, cl_mem const *objects,
                     bool toOpenGL) {
    for (cl_uint i = 0; i < count; ++i) {
        auto const found = state.memory.find(objects[i]);
        if (found == state.memory.end())
            return CL_INVALID_GL_OBJECT;
        SharedMemory const &shared = found->second;
        if (shared.context != context)
            return CL_INVALID_CONTEXT;
        if (shared.acquired != toOpenGL)
            return CL_INVALID_OPERATION;
        GLObject now = shared.object;
        if (Describe(now) != CL_SUCCESS || !now.hasSameStorage(shared.object))
            return CL_INVALID_GL_OBJECT;
    }
    return CL_SUCCESS;
}

/// Acquires or releases.
cl_int Transfer(bool toOpenGL, cl_command_queue queue, cl_uint count, cl_mem const *objects,
                cl_uint waitCount, cl_event const *waits, cl_event *event) {
    if ((count == 0) != (objects == nullptr))
        return CL_INVALID_VALUE;
    if ((waitCount == 0) != (waits == nullptr))
        return CL_INVALID_EVENT_WAIT_LIST;
    cl_context context = nullptr;
    if (cl_int const error = System().clGetCommandQueueInfo(queue, CL_QUEUE_CONTEXT, sizeof context,
                                                            &context, nullptr))
        return error;
    ORU_LOCKED_STATE(state);
    auto const sharing = state.contexts.find(context);
    if (sharing == state.contexts.end())
        return CL_INVALID_CONTEXT;
    CurrentGL const current(sharing->second.dc, sharing->second.context);
    if (!current)
        return CL_INVALID_GL_OBJECT;
    if (cl_int const error = CheckTransfer(state, context, count, objects, toOpenGL))
        return error;
    if (waitCount > 0)
        if (cl_int const error = System().clWaitForEvents(waitCount, waits))
            return error;
    for (cl_uint i = 0; i < count; ++i) {
        SharedMemory &shared = state.memory[objects[i]];
        if (cl_int const error = Copy(queue, objects[i], shared.object, toOpenGL))
            return error;
        shared.acquired = !toOpenGL;
    }
    if (!event)
        return CL_SUCCESS;
    cl_int const error = System().clEnqueueMarker(queue, event);
    if (error == CL_SUCCESS)
        state.events[*event] =
            toOpenGL ? CL_COMMAND_RELEASE_GL_OBJECTS : CL_COMMAND_ACQUIRE_GL_OBJECTS;
    return error;
}

cl_int CL_API_CALL EnqueueAcquire(cl_command_queue queue, cl_uint count, cl_mem const *objects,
                                  cl_uint waitCount, cl_event const *waits, cl_event *event) {
    return Transfer(false, queue, count, objects, waitCount, waits, event);
}

cl_int CL_API_CALL EnqueueRelease(cl_command_queue queue, cl_uint count, cl_mem const *objects,
                                  cl_uint waitCount, cl_event const *waits, cl_event *event) {
    return Transfer(true, queue, count, objects, waitCount, waits, event);
}

cl_int CL_API_CALL GetEventInfo(cl_event event, cl_event_info query, std::size_t room, void *result,
                                std::size_t *sizeReturned) {
    ORU_LOCKED_STATE(state);
    auto const found = state.events.find(event);
    if (found == state.events.end() || query != CL_EVENT_COMMAND_TYPE)
        return System().clGetEventInfo(event, query, room, result, sizeReturned);
    return Answer(&found->second, sizeof found->second, room, result, sizeReturned);
}

cl_int CL_API_CALL SetKernelArg(cl_kernel kernel, cl_uint index, std::size_t size,
                                void const *value) {
    ORU_LOCKED_STATE(state);
    auto &arguments = state.arguments[kernel];
    arguments.erase(index);
    if (size == sizeof(cl_mem) && value) {
        cl_mem const memory = *static_cast<cl_mem const *>(value);
        if (state.memory.count(memory) > 0)
            arguments[index] = memory;
    }
    return System().clSetKernelArg(kernel, index, size, value);
}

} // namespace

bool MayUse(cl_mem memory) {
    ORU_LOCKED_STATE(state);
    auto const found = state.memory.find(memory);
    return found == state.memory.end() || found->second.acquired;
}

bool MayUse(cl_kernel kernel) {
    ORU_LOCKED_STATE(state);
    for (auto const &argument : state.arguments[kernel])
        if (!MayUse(argument.second))
            return false;
    return true;
}

void Forget(void const *handle) {
    ORU_LOCKED_STATE(state);
    void *const key = const_cast<void *>(handle);
    state.contexts.erase(static_cast<cl_context>(key));
    state.memory.erase(static_cast<cl_mem>(key));
    state.arguments.erase(static_cast<cl_kernel>(key));
    state.events.erase(static_cast<cl_event>(key));
}

void ReplaceSharing(FunctionTable &table) {
    table.clCreateContext = CreateContext;
    table.clCreateContextFromType = CreateContextFromType;
    table.clGetContextInfo = GetContextInfo;
    table.clGetGLContextInfoKHR = GetGLContextInfo;
    table.clCreateFromGLBuffer = CreateFromGLBuffer;
    table.clCreateFromGLTexture2D = CreateFromGLTexture2D;
    table.clCreateFromGLTexture3D = CreateFromGLTexture3D;
    table.clCreateFromGLRenderbuffer = CreateFromGLRenderbuffer;
    table.clGetGLObjectInfo = GetGLObjectInfo;
    table.clGetGLTextureInfo = GetGLTextureInfo;
    table.clEnqueueAcquireGLObjects = EnqueueAcquire;
    table.clEnqueueReleaseGLObjects = EnqueueRelease;
    table.clGetEventInfo = GetEventInfo;
    table.clSetKernelArg = SetKernelArg;
}

} // namespace oru_test::runtime
